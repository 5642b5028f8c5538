#pragma once

#include "alerts/Delivery_Pace.h"
#include "schema/module_registration.h"

#include <atomic>
#include <cstring>

namespace KPRV {

inline const Registration* alert_registration()
{
    const Registration* each = _cimple_registration_head;
    while (strcmp(each->provider_name, "KALDERA_AlertIndication_Provider") != 0)
        each = each->next;
    return each;
}

/// The delivery thread's clock, for a scope: it stands still but for its sleeps, so that each should be a
/// whole period.
class Pace_Override
{
public:
    /// What a sleep does in the place of sleeping.
    explicit Pace_Override(void (*sleep)(uint64 moment)) : _product(delivery_pace)
    {
        clock = 1;
        delivery_pace = {[]() -> uint64 { return clock; }, sleep};
    }
    ~Pace_Override() { delivery_pace = _product; }
    Pace_Override(const Pace_Override&) = delete;
    Pace_Override& operator=(const Pace_Override&) = delete;

    static inline std::atomic<uint64> clock;

private:
    const Delivery_Pace _product;
};

/// Sleeps as short as can be, and counted.
class Short_Pace
{
public:
    Short_Pace()
    {
        passes = 0;
        strange = 0;
    }

    static inline std::atomic<int> passes;
    /// Sleeps of another length than the product's.
    static inline std::atomic<int> strange;

private:
    const Pace_Override _pace{[](uint64 moment) {
        passes++;
        strange += moment - Pace_Override::clock.exchange(moment) != 20000;
        Time::sleep(50);
    }};
};

} // namespace KPRV

#pragma once

#include "module/alerts/Delivery_Pause.h"
#include "module/schema/module_registration.h"

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

/// Puts a function in the place of the delivery thread's sleep for a scope.
class Delivery_Pause_Override
{
public:
    explicit Delivery_Pause_Override(void (*sleep)(uint64)) { Delivery_Pause::sleep = sleep; }
    ~Delivery_Pause_Override() { Delivery_Pause::sleep = Time::sleep; }
    Delivery_Pause_Override(const Delivery_Pause_Override&) = delete;
    Delivery_Pause_Override& operator=(const Delivery_Pause_Override&) = delete;
};

/// Sleeps as short as can be, and counted.
class Short_Pauses
{
public:
    Short_Pauses()
    {
        count = 0;
        strange = 0;
    }

    static inline std::atomic<int> count;
    /// Sleeps of another length than the product's.
    static inline std::atomic<int> strange;

private:
    const Delivery_Pause_Override _override{[](uint64 microseconds) {
        count++;
        strange += microseconds != 20000;
        Time::sleep(50);
    }};
};

} // namespace KPRV

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

/// The delivery thread's waiting, for a scope: as short as can be, and counted.
class Short_Pace
{
public:
    Short_Pace()
    {
        passes = 0;
        strange = 0;
        delivery_pace.sleep = [](uint64 microseconds) {
            passes++;
            strange += microseconds != 20000;
            Time::sleep(50);
        };
    }
    ~Short_Pace() { delivery_pace.sleep = Time::sleep; }
    Short_Pace(const Short_Pace&) = delete;
    Short_Pace& operator=(const Short_Pace&) = delete;

    static inline std::atomic<int> passes;
    /// Sleeps of another length than the product's.
    static inline std::atomic<int> strange;
};

} // namespace KPRV

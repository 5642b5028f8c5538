#pragma once

#include "module/runtime/system/Time.h"

namespace KPRV {

/// The sleep of the delivery thread, in every pass, whether or not an alert was delivered: two alerts are
/// never less than this apart, however long a delivery takes. Nothing in the product changes it; a test puts
/// its own in its place.
class Delivery_Pause
{
public:
    static constexpr uint64 LENGTH = 20 * Time::MSEC;

    static void wait() { sleep(LENGTH); }

private:
    using Sleep = void (*)(uint64 microseconds);
    static inline constinit Sleep sleep = Time::sleep;

    friend class Delivery_Pause_Override;
};

} // namespace KPRV

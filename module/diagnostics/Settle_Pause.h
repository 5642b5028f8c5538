#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

/// The time that a port is given to settle: after it was disabled, after a loopback test, after it was
/// enabled. Nothing in the product changes it; a test waits shorter.
class Settle_Pause
{
public:
    /// 2 seconds.
    static void wait();

private:
    using Sleep = void (*)(uint64 microseconds);
    static Sleep sleep;

    friend struct Settle_Pause_Override;
};

} // namespace KPRV

#pragma once

#include "module/diagnostics/Settle_Pause.h"

namespace KPRV {

/// Puts a function in the place of the sleep for a scope.
struct Settle_Pause_Override
{
    explicit Settle_Pause_Override(void (*sleep)(uint64)) { Settle_Pause::sleep = sleep; }
    ~Settle_Pause_Override() { Settle_Pause::sleep = _old; }
    Settle_Pause_Override(const Settle_Pause_Override&) = delete;
    Settle_Pause_Override& operator=(const Settle_Pause_Override&) = delete;

private:
    void (*const _old)(uint64) = Settle_Pause::sleep;
};

} // namespace KPRV

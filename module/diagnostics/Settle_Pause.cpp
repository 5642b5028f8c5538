#include "module/diagnostics/Settle_Pause.h"

#include "module/runtime/system/Time.h"

namespace KPRV {

constinit Settle_Pause::Sleep Settle_Pause::sleep = Time::sleep;

void Settle_Pause::wait()
{
    sleep(2 * Time::SEC);
}

} // namespace KPRV

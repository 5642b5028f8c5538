#include "runtime/version.h"

namespace KPRV {

extern constexpr int __cimple_version_2_0_16 = 0x02000010;

} // namespace KPRV

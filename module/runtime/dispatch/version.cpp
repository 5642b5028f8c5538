#include "module/runtime/dispatch/version.h"

extern "C" const int __cimple_version_2_0_16 = 0x02000010;

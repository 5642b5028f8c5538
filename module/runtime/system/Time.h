#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV::Time {

inline constexpr uint64 USEC = 1;
inline constexpr uint64 MSEC = 1000;
inline constexpr uint64 SEC = 1000000;

/// Microseconds since the epoch.
uint64 now();
/// Sleeps for no less than that, signals or not.
void sleep(uint64 microseconds);

} // namespace KPRV::Time

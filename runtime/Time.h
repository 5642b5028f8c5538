#pragma once

#include "runtime/Types.h"

namespace KPRV::Time {

inline constexpr uint64 USEC = 1;
inline constexpr uint64 MSEC = 1000;
inline constexpr uint64 SEC = 1000000;

/// Microseconds since the epoch.
uint64 now();
void sleep(uint64 microseconds);

/// Microseconds of a clock that nobody sets: good for spans, and for `sleep_until` alone.
uint64 monotonic();
/// Sleeps until `monotonic()` has come to the moment, signals or not; returns at once if it has.
void sleep_until(uint64 moment);

} // namespace KPRV::Time

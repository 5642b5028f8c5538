#pragma once

#include <cstddef>

namespace KPRV::bench {

/// From now on the peak is counted from what is allocated now.
void begin_heap_peak();
/// The most bytes that were allocated since then beyond what was allocated then.
size_t heap_peak();

} // namespace KPRV::bench

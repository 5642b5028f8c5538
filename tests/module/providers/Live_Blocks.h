#pragma once

#include <cstddef>

namespace KPRV {

/// Blocks that `operator new` has given out and that are not back yet, in the whole program: instances, their
/// texts, and what else there is.
size_t live_blocks();

} // namespace KPRV

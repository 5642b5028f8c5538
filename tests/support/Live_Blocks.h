#pragma once

#include <cstddef>

namespace KPRV {

/// Blocks that `operator new` has given out and that are not back yet, in the whole program: instances, their
/// texts, and what else there is.
size_t live_blocks();

/// The n-th block that the calling thread asks for from now on, counted from 1, is refused, and no other.
void refuse_block(size_t nth);
/// No block is refused any more. How many the thread has asked for since.
size_t grant_blocks();

} // namespace KPRV

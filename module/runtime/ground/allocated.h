#pragma once

#include <new>

namespace KPRV {

/// The block that `malloc` or `realloc` gave. Without memory throws `std::bad_alloc`, as operator new does,
/// so that an operation ends and its server does not; the block that was to grow stays as it was.
inline void* allocated(void* block)
{
    if (!block)
        throw std::bad_alloc();
    return block;
}

} // namespace KPRV

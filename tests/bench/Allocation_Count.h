#pragma once

#include <cstddef>

namespace KPRV::bench {

/// What the process has asked of the allocator so far: calls of malloc, calloc and realloc, on any thread,
/// and the bytes asked for. The lean server asks nothing, so between two readings stand the provider and the
/// library's answers alone.
struct Allocations
{
    size_t calls;
    size_t bytes;
};

Allocations allocations();

} // namespace KPRV::bench

#include "tests/bench/Allocation_Count.h"

#include <atomic>

// The program's own allocator in front of the C library's: every library in the process calls it.
extern "C" {
void* __libc_malloc(size_t size);
void* __libc_calloc(size_t count, size_t size);
void* __libc_realloc(void* block, size_t size);
}

namespace {

// Plain additions: the benchmarks allocate on one thread, and a locked addition would be a cost of its own.
constinit std::atomic<size_t> calls = 0;
constinit std::atomic<size_t> bytes = 0;

void count(size_t size)
{
    calls.store(calls.load(std::memory_order_relaxed) + 1, std::memory_order_relaxed);
    bytes.store(bytes.load(std::memory_order_relaxed) + size, std::memory_order_relaxed);
}

} // namespace

extern "C" {

[[gnu::visibility("default")]] void* malloc(size_t size)
{
    count(size);
    return __libc_malloc(size);
}

[[gnu::visibility("default")]] void* calloc(size_t number, size_t size)
{
    count(number * size);
    return __libc_calloc(number, size);
}

[[gnu::visibility("default")]] void* realloc(void* block, size_t size)
{
    count(size);
    return __libc_realloc(block, size);
}

} // extern "C"

namespace KPRV::bench {

Allocations allocations()
{
    return {calls.load(std::memory_order_relaxed), bytes.load(std::memory_order_relaxed)};
}

} // namespace KPRV::bench

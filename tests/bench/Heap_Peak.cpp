#include "tests/bench/Heap_Peak.h"

#include <malloc.h>

// The program's own allocator in front of the C library's, as in Allocation_Count.cpp. One that also looks at
// each block costs more: only a program that counts no instructions has it.
extern "C" {
void* __libc_malloc(size_t size);
void* __libc_calloc(size_t count, size_t size);
void* __libc_realloc(void* block, size_t size);
void __libc_free(void* block);
}

namespace {

constinit ptrdiff_t live = 0;
constinit ptrdiff_t at_begin = 0;
constinit ptrdiff_t most = 0;

void lose(void* block)
{
    live -= static_cast<ptrdiff_t>(malloc_usable_size(block));
}

void* gain(void* block)
{
    live += static_cast<ptrdiff_t>(malloc_usable_size(block));
    if (live > most)
        most = live;
    return block;
}

} // namespace

extern "C" {

[[gnu::visibility("default")]] void* malloc(size_t size)
{
    return gain(__libc_malloc(size));
}

[[gnu::visibility("default")]] void* calloc(size_t number, size_t size)
{
    return gain(__libc_calloc(number, size));
}

[[gnu::visibility("default")]] void* realloc(void* block, size_t size)
{
    lose(block);
    return gain(__libc_realloc(block, size));
}

[[gnu::visibility("default")]] void free(void* block)
{
    lose(block);
    __libc_free(block);
}

} // extern "C"

namespace KPRV::bench {

void begin_heap_peak()
{
    at_begin = most = live;
}

size_t heap_peak()
{
    return static_cast<size_t>(most - at_begin);
}

} // namespace KPRV::bench

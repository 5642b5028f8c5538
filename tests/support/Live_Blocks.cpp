#include "tests/support/Live_Blocks.h"

#include <atomic>
#include <cstdlib>
#include <new>

// Instances come from `operator new`, so that what a provider forgets is seen here also where no sanitizer
// runs.

namespace {

std::atomic<size_t> live = 0;
thread_local size_t blocks_asked = 0, block_refused = 0;

void* counted(size_t size)
{
    if (++blocks_asked == block_refused)
        throw std::bad_alloc();
    void* const block = std::malloc(size ? size : 1);
    if (!block)
        throw std::bad_alloc();
    live++;
    return block;
}

void returned(void* block)
{
    if (block)
        live--;
    std::free(block);
}

} // namespace

size_t KPRV::live_blocks()
{
    return live;
}

void KPRV::refuse_block(size_t nth)
{
    blocks_asked = 0;
    block_refused = nth;
}

size_t KPRV::grant_blocks()
{
    block_refused = 0;
    return blocks_asked;
}

void* operator new(size_t size)
{
    return counted(size);
}
void* operator new[](size_t size)
{
    return counted(size);
}
void operator delete(void* block) noexcept
{
    returned(block);
}
void operator delete[](void* block) noexcept
{
    returned(block);
}
void operator delete(void* block, size_t) noexcept
{
    returned(block);
}
void operator delete[](void* block, size_t) noexcept
{
    returned(block);
}

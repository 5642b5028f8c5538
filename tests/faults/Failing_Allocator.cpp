#include "tests/faults/Failing_Allocator.h"

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <link.h>
#include <new>

namespace KPRV {

namespace {

std::uintptr_t library_begin = 0;
std::uintptr_t library_end = 0;
thread_local unsigned long seen = 0;
thread_local unsigned long first_to_fail = 0;

int find_library(dl_phdr_info* info, size_t, void* path_part)
{
    if (!std::strstr(info->dlpi_name, static_cast<const char*>(path_part)))
        return 0;
    for (int i = 0; i < info->dlpi_phnum; ++i) {
        const ElfW(Phdr)& part = info->dlpi_phdr[i];
        if (part.p_type != PT_LOAD || !(part.p_flags & PF_X))
            continue;
        library_begin = info->dlpi_addr + part.p_vaddr;
        library_end = library_begin + part.p_memsz;
    }
    return 1;
}

} // namespace

/// True if this allocation, asked for from that place, is one that has to fail.
bool must_fail(const void* caller)
{
    const auto at = reinterpret_cast<std::uintptr_t>(caller);
    if (first_to_fail == 0 || at < library_begin || at >= library_end)
        return false;
    return ++seen >= first_to_fail;
}

void watch_library(const char* path_part)
{
    library_begin = library_end = 0;
    dl_iterate_phdr(find_library, const_cast<char*>(path_part));
}

void fail_allocation(unsigned long nth)
{
    seen = 0;
    first_to_fail = nth;
}

unsigned long mend_memory()
{
    first_to_fail = 0;
    return seen;
}

} // namespace KPRV

// The module asks for memory through operator new alone, or through malloc and realloc; both end here.
// Sanitizers have a malloc of their own, so that under them only operator new fails.
void* operator new(std::size_t size)
{
    void* block = KPRV::must_fail(__builtin_return_address(0)) ? nullptr : std::malloc(size);
    if (!block)
        throw std::bad_alloc();
    return block;
}

void operator delete(void* block) noexcept
{
    std::free(block);
}

void operator delete(void* block, std::size_t) noexcept
{
    std::free(block);
}

#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)

extern "C" void* __libc_malloc(std::size_t size);
extern "C" void* __libc_realloc(void* block, std::size_t size);

extern "C" void* malloc(std::size_t size)
{
    return KPRV::must_fail(__builtin_return_address(0)) ? nullptr : __libc_malloc(size);
}

extern "C" void* realloc(void* block, std::size_t size)
{
    return KPRV::must_fail(__builtin_return_address(0)) ? nullptr : __libc_realloc(block, size);
}

#endif

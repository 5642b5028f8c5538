#include "tests/faults/Failing_Allocator.h"

#include <atomic>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <link.h>
#include <new>
#include <unwind.h>

namespace KPRV {

namespace {

struct Library
{
    const char* path_part;
    std::uintptr_t begin = 0;
    std::uintptr_t end = 0;

    bool holds(std::uintptr_t at) const { return at >= begin && at < end; }
};

Library watched = {nullptr};
/// What works on behalf of whoever called it.
Library helpers[] = {{"libstdc++"}, {"libjsoncpp"}};
bool with_helpers = false;

std::atomic<unsigned long> first_on_new_threads = 0;
std::atomic<unsigned long> last_on_new_threads = 0;
std::atomic<unsigned long> most_seen_on_new_threads = 0;

thread_local unsigned long seen = 0;
thread_local unsigned long first_to_fail = first_on_new_threads;
thread_local unsigned long last_to_fail = last_on_new_threads;

int find_library(dl_phdr_info* info, size_t, void* data)
{
    Library& library = *static_cast<Library*>(data);
    if (!std::strstr(info->dlpi_name, library.path_part))
        return 0;
    for (int i = 0; i < info->dlpi_phnum; ++i) {
        const ElfW(Phdr)& part = info->dlpi_phdr[i];
        if (part.p_type != PT_LOAD || !(part.p_flags & PF_X))
            continue;
        library.begin = info->dlpi_addr + part.p_vaddr;
        library.end = library.begin + part.p_memsz;
    }
    return 1;
}

bool is_helper(std::uintptr_t at)
{
    return helpers[0].holds(at) || helpers[1].holds(at);
}

struct Walk
{
    std::uintptr_t from;
    bool reached = false;
    bool is_for_watched = false;
};

/// Looks for the first frame, from the helper's on, that is no helper's.
_Unwind_Reason_Code look_at_frame(_Unwind_Context* context, void* data)
{
    Walk& walk = *static_cast<Walk*>(data);
    const std::uintptr_t at = _Unwind_GetIP(context);
    walk.reached = walk.reached || at == walk.from;
    if (!walk.reached || is_helper(at))
        return _URC_NO_REASON;
    walk.is_for_watched = watched.holds(at);
    return _URC_NORMAL_STOP;
}

bool is_for_watched(std::uintptr_t caller)
{
    if (!with_helpers || !is_helper(caller))
        return watched.holds(caller);
    Walk walk{caller};
    _Unwind_Backtrace(look_at_frame, &walk);
    return walk.is_for_watched;
}

} // namespace

/// True if this allocation, asked for from that place, is one that has to fail.
bool must_fail(const void* caller)
{
    if (first_to_fail == 0 || !is_for_watched(reinterpret_cast<std::uintptr_t>(caller)))
        return false;
    ++seen;
    if (first_on_new_threads != 0 && seen > most_seen_on_new_threads)
        most_seen_on_new_threads = seen;
    return seen >= first_to_fail && seen <= last_to_fail;
}

void watch_library(const char* path_part, bool helpers_too)
{
    watched = {path_part};
    dl_iterate_phdr(find_library, &watched);
    for (Library& helper : helpers)
        dl_iterate_phdr(find_library, &helper);
    with_helpers = helpers_too;
}

void fail_allocation(unsigned long nth, bool once)
{
    seen = 0;
    first_to_fail = nth;
    last_to_fail = once ? nth : ~0ul;
}

unsigned long fail_allocation_of_new_threads(unsigned long nth, bool once)
{
    first_on_new_threads = nth;
    last_on_new_threads = once ? nth : ~0ul;
    return most_seen_on_new_threads.exchange(0);
}

unsigned long mend_memory()
{
    first_to_fail = 0;
    return seen;
}

} // namespace KPRV

// The module asks for memory through operator new alone, or through malloc and realloc; both end here. So
// does the JSON library. What the C++ library asks malloc for is room for an exception, of which it has some
// put by. Sanitizers have a malloc of their own, so that under them only operator new fails.
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

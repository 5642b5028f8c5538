// The module pauses for seconds where a port has to settle, and between two alerts. In this program all
// pauses are short.
#include <ctime>
#include <dlfcn.h>
#include <sys/select.h>

namespace {

/// Where times outgrow the word, the functions have other names in the C library.
constexpr bool has_long_times = sizeof(time_t) > sizeof(long);

template <class Function>
Function* real(const char* name, const char* name_with_long_times)
{
    return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, has_long_times ? name_with_long_times : name));
}

} // namespace

extern "C" [[gnu::visibility("default")]] int select(int count, fd_set* read, fd_set* write, fd_set* except,
                                                     timeval* limit)
{
    static auto* const wait = real<decltype(select)>("select", "__select64");
    timeval pause = {0, 1000};
    return wait(count, read, write, except, count == 0 && limit ? &pause : limit);
}

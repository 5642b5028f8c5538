// The module pauses with select, for seconds where a port has to settle. In this program such a pause is a
// short one.
#include <ctime>
#include <dlfcn.h>
#include <sys/select.h>

extern "C" [[gnu::visibility("default")]] int select(int count, fd_set* read, fd_set* write, fd_set* except,
                                                     timeval* limit)
{
    // Where times outgrow the word, the function has another name in the C library.
    constexpr const char* name = sizeof(time_t) > sizeof(long) ? "__select64" : "select";
    static const auto real = reinterpret_cast<decltype(&select)>(dlsym(RTLD_NEXT, name));
    timeval short_pause = {0, 1000};
    const bool is_long_pause = count == 0 && limit && limit->tv_sec > 0;
    return real(count, read, write, except, is_long_pause ? &short_pause : limit);
}

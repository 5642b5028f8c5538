#include "kldrcim/verbs/Walk_Progress.h"

#include <chrono>
#include <cstdio>
#include <unistd.h>

namespace KPRV::kldrcim {

using namespace std::chrono_literals;

Walk_Progress::Walk_Progress()
{
    if (isatty(STDERR_FILENO))
        _thread = std::thread([this] { show(); });
}

void Walk_Progress::at(const std::string& class_name, std::size_t count)
{
    const Auto_Lock lock(_mutex);
    _class_name = class_name;
    _count = count;
}

void Walk_Progress::show()
{
    const Auto_Lock lock(_mutex);
    auto next = std::chrono::steady_clock::now() + 1s;
    bool is_shown = false;
    while (!_is_over) {
        if (_change.wait_until(_mutex, next) == std::cv_status::no_timeout)
            continue;
        put_line();
        is_shown = true;
        next += 200ms;
    }
    if (is_shown)
        std::fputs("\r\33[K", stderr);
}

void Walk_Progress::put_line()
{
    std::fprintf(stderr, "\r\33[Kkldrcim: asking for %s", _class_name.c_str());
    if (_count != 0)
        std::fprintf(stderr, ", %zu so far", _count);
    std::fflush(stderr);
}

void Walk_Progress::end()
{
    {
        const Auto_Lock lock(_mutex);
        _is_over = true;
    }
    _change.notify_all();
    if (_thread.joinable())
        _thread.join();
}

} // namespace KPRV::kldrcim

#include "kldrcim/verbs/Walk_Progress.h"

#include <chrono>
#include <cstdio>
#include <unistd.h>

namespace KPRV::kldrcim {

using namespace std::chrono_literals;

Walk_Progress::Walk_Progress()
{
    if (isatty(STDERR_FILENO))
        thread_ = std::thread([this] { show(); });
}

void Walk_Progress::at(const std::string& class_name, std::size_t count)
{
    const Auto_Lock lock(mutex_);
    class_name_ = class_name;
    count_ = count;
}

void Walk_Progress::show()
{
    const Auto_Lock lock(mutex_);
    auto next = std::chrono::steady_clock::now() + 1s;
    bool is_shown = false;
    while (!is_over_) {
        if (change_.wait_until(mutex_, next) == std::cv_status::no_timeout)
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
    std::fprintf(stderr, "\r\33[Kkldrcim: asking for %s", class_name_.c_str());
    if (count_ != 0)
        std::fprintf(stderr, ", %zu so far", count_);
    std::fflush(stderr);
}

void Walk_Progress::end()
{
    {
        const Auto_Lock lock(mutex_);
        is_over_ = true;
    }
    change_.notify_all();
    if (thread_.joinable())
        thread_.join();
}

} // namespace KPRV::kldrcim

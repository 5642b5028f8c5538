#include "kldrcim/formats/Output.h"

#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <fcntl.h>
#include <optional>
#include <unistd.h>

namespace KPRV::kldrcim {

void begin_output()
{
    std::signal(SIGPIPE, SIG_IGN);
    // A descriptor that cannot be written to keeps the place.
    for (const int descriptor : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO})
        if (fcntl(descriptor, F_GETFD) < 0)
            open("/dev/null", descriptor == STDIN_FILENO ? O_WRONLY : O_RDONLY);
}

void put(std::string_view text)
{
    if (std::fwrite(text.data(), 1, text.size(), stdout) != text.size())
        throw Output_Error{errno};
}

void flush_in_time()
{
    using Clock = std::chrono::steady_clock;
    constexpr std::chrono::milliseconds moment{50};
    static std::optional<Clock::time_point> latest;
    const auto now = Clock::now();
    if (latest && now - *latest < moment)
        return;
    latest = now;
    flush_output();
}

void flush_output()
{
    if (std::fflush(stdout) != 0)
        throw Output_Error{errno};
}

} // namespace KPRV::kldrcim

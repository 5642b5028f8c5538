#include "kldrcim/formats/Terminal.h"

#include <cstdlib>
#include <string_view>
#include <sys/ioctl.h>
#include <unistd.h>

namespace KPRV::kldrcim {

std::size_t terminal_width()
{
    winsize size = {};
    return isatty(STDOUT_FILENO) && ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 ? size.ws_col : 0;
}

bool terminal_shows_colors()
{
    const char* const refusal = std::getenv("NO_COLOR");
    const char* const kind = std::getenv("TERM");
    return isatty(STDOUT_FILENO) && (!refusal || !*refusal) && kind && std::string_view(kind) != "dumb";
}

} // namespace KPRV::kldrcim

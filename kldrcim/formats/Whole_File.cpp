#include "kldrcim/formats/Whole_File.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <string_view>
#include <sys/stat.h>
#include <unistd.h>

namespace KPRV::kldrcim {

namespace {

/// Writes all of it, out to the disk; false with errno.
bool write_all(int file, std::string_view text)
{
    while (!text.empty()) {
        const ssize_t size = write(file, text.data(), text.size());
        if (size < 0 && errno != EINTR)
            return false;
        text.remove_prefix(size < 0 ? 0 : static_cast<std::size_t>(size));
    }
    return fsync(file) == 0;
}

/// The rights of a file that is made as usual.
mode_t usual_mode()
{
    const mode_t mask = umask(0);
    umask(mask);
    return 0666 & ~mask;
}

} // namespace

int write_whole_file(const std::string& name, const std::string& text)
{
    const std::size_t slash = name.rfind('/') + 1;
    std::string beside = name.substr(0, slash) + "." + name.substr(slash) + ".XXXXXX";
    const int file = mkstemp(beside.data());
    if (file < 0)
        return errno;
    const bool is_written = fchmod(file, usual_mode()) == 0 && write_all(file, text);
    int error = is_written ? 0 : errno;
    if (close(file) != 0 && error == 0)
        error = errno;
    if (error == 0 && std::rename(beside.c_str(), name.c_str()) != 0)
        error = errno;
    if (error != 0)
        unlink(beside.c_str());
    return error;
}

} // namespace KPRV::kldrcim

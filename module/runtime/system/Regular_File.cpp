#include "module/runtime/system/Regular_File.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace KPRV {

int open_regular_file(const char* path, int flags, mode_t mode)
{
    const int descriptor = open(path, flags | O_CLOEXEC | O_NONBLOCK | O_NOCTTY, mode);
    if (descriptor < 0)
        return -1;
    struct stat status;
    if (fstat(descriptor, &status) == 0 && S_ISREG(status.st_mode))
        return descriptor;
    close(descriptor);
    return -1;
}

} // namespace KPRV

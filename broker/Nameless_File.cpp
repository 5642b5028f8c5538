#include "broker/Nameless_File.h"

#include <cstdlib>
#include <fcntl.h>
#include <string>
#include <unistd.h>

namespace KPRV::broker {

int nameless_file()
{
    const char* const named = std::getenv("TMPDIR");
    const std::string folder = named && *named ? named : "/var/tmp";
    const int file = open(folder.c_str(), O_TMPFILE | O_RDWR | O_CLOEXEC, 0600);
    if (file >= 0)
        return file;
    // Not every file system can make one without a name.
    std::string name = folder + "/kldrcim-XXXXXX";
    const int named_file = mkostemp(name.data(), O_CLOEXEC);
    if (named_file >= 0)
        unlink(name.c_str());
    return named_file;
}

} // namespace KPRV::broker

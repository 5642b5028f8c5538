#pragma once

#include <sys/types.h>

namespace KPRV {

/// Opens a file by the flags of `open`, and never waits for it. The descriptor, closed in other programs, or
/// -1: for what cannot be opened, and for what is no regular file, behind symbolic links too. A FIFO or a
/// device in the place of a file would hold up the whole server.
int open_regular_file(const char* path, int flags, mode_t mode = 0);

} // namespace KPRV

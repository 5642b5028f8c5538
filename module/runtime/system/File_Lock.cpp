#include "module/runtime/system/File_Lock.h"
#include "module/runtime/system/Regular_File.h"

#include <cerrno>
#include <fcntl.h>
#include <unistd.h>

namespace KPRV {

struct File_Lock::Rep
{
    struct flock lock;
    struct flock unlock;
    int fd;
};

static struct flock whole_file(short type)
{
    struct flock record = {};
    record.l_type = type;
    record.l_whence = SEEK_SET;
    return record;
}

static int apply(int fd, const struct flock& record)
{
    int status;
    do {
        status = fcntl(fd, F_SETLKW, &record);
    } while (status == -1 && errno == EINTR);
    return status;
}

File_Lock::File_Lock(const char* path)
    : _rep(new Rep{whole_file(F_WRLCK), whole_file(F_UNLCK),
                   open_regular_file(path, O_WRONLY | O_CREAT, 0600)})
{
}

File_Lock::~File_Lock()
{
    if (okay())
        close(_rep->fd);
    delete _rep;
}

bool File_Lock::okay() const
{
    return _rep->fd != -1;
}

int File_Lock::lock()
{
    return okay() ? apply(_rep->fd, _rep->lock) : -1;
}

int File_Lock::unlock()
{
    return okay() ? apply(_rep->fd, _rep->unlock) : -1;
}

} // namespace KPRV

#pragma once

namespace KPRV {

/// Advisory lock on a whole file that keeps processes apart (not threads: those need a mutex beside it).
class File_Lock
{
public:
    /// Opens the file for writing, created with mode 0600 if missing. What is no regular file is not opened.
    explicit File_Lock(const char* path);
    ~File_Lock();
    File_Lock(const File_Lock&) = delete;
    File_Lock& operator=(const File_Lock&) = delete;

    bool okay() const;
    /// Waits for the lock. 0, or -1.
    int lock();
    int unlock();

private:
    struct Rep;
    Rep* _rep;
};

} // namespace KPRV

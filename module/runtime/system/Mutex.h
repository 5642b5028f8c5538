#pragma once

#include "module/runtime/system/Auto_Lock.h"

#include <pthread.h>

namespace KPRV {

/// A POSIX mutex.
class CAPABILITY("mutex") Mutex
{
public:
    explicit Mutex(bool recursive = true);
    ~Mutex();
    Mutex(const Mutex&) = delete;
    Mutex& operator=(const Mutex&) = delete;

    /// A failure is fatal.
    void lock() ACQUIRE();
    /// 0 when locked, 16 (`EBUSY`) when held elsewhere, -1 on any other error.
    int try_lock() TRY_ACQUIRE(0);
    void unlock() RELEASE();

private:
    pthread_mutex_t _mutex;
};

/// Holds one for a scope.
using Auto_Mutex = Auto_Lock<Mutex>;

} // namespace KPRV

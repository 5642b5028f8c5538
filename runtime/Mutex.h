#pragma once

#include <pthread.h>

namespace KPRV {

/// A POSIX mutex.
class Mutex
{
public:
    explicit Mutex(bool recursive = true);
    ~Mutex();
    Mutex(const Mutex&) = delete;
    Mutex& operator=(const Mutex&) = delete;

    /// A failure is fatal.
    void lock();
    /// 0 when locked, 16 (`EBUSY`) when held elsewhere, -1 on any other error.
    int try_lock();
    void unlock();

private:
    pthread_mutex_t _mutex;
};

/// Holds a mutex for a scope.
class Auto_Mutex
{
public:
    explicit Auto_Mutex(Mutex& mutex) : _mutex(mutex) { _mutex.lock(); }
    ~Auto_Mutex() { _mutex.unlock(); }
    Auto_Mutex(const Auto_Mutex&) = delete;
    Auto_Mutex& operator=(const Auto_Mutex&) = delete;

private:
    Mutex& _mutex;
};

} // namespace KPRV

#pragma once

#include "module/runtime/system/thread_annotations.h"

namespace KPRV {

/// Holds a mutex of whatever class for a scope.
template <class Kind>
class SCOPED_CAPABILITY Auto_Lock
{
public:
    explicit Auto_Lock(Kind& mutex) ACQUIRE(mutex) : _mutex(mutex) { _mutex.lock(); }
    ~Auto_Lock() RELEASE() { _mutex.unlock(); }
    Auto_Lock(const Auto_Lock&) = delete;
    Auto_Lock& operator=(const Auto_Lock&) = delete;

private:
    Kind& _mutex;
};

/// As above, beside others that only read.
template <class Kind>
class SCOPED_CAPABILITY Auto_Shared_Lock
{
public:
    explicit Auto_Shared_Lock(Kind& mutex) ACQUIRE_SHARED(mutex) : _mutex(mutex) { _mutex.lock_shared(); }
    ~Auto_Shared_Lock() RELEASE() { _mutex.unlock_shared(); }
    Auto_Shared_Lock(const Auto_Shared_Lock&) = delete;
    Auto_Shared_Lock& operator=(const Auto_Shared_Lock&) = delete;

private:
    Kind& _mutex;
};

} // namespace KPRV

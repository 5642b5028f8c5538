#pragma once

#include "module/runtime/system/Auto_Lock.h"

#include <mutex>

namespace KPRV {

/// A mutex of the standard library that clang can follow. `Kind` is `std::mutex`, `std::recursive_mutex` or
/// `std::shared_mutex`; the functions are its own, and a failure throws as there. Usable as a
/// constant-initialised static, and where a `std::condition_variable_any` wants a lock.
template <class Kind = std::mutex>
class CAPABILITY("mutex") Standard_Mutex
{
public:
    void lock() ACQUIRE() { _mutex.lock(); }
    void unlock() RELEASE() { _mutex.unlock(); }
    void lock_shared() ACQUIRE_SHARED() { _mutex.lock_shared(); }
    void unlock_shared() RELEASE_SHARED() { _mutex.unlock_shared(); }

private:
    Kind _mutex;
};

} // namespace KPRV

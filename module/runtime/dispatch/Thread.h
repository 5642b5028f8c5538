#pragma once

#include "module/runtime/ground/Types.h"

#include <pthread.h>

namespace KPRV {

/// Handle of a POSIX thread. A thread that is created where a `Thread_Context` is on the stack gets one of
/// its own.
class Thread
{
public:
    Thread();
    Thread(const Thread& x);
    Thread& operator=(const Thread& x);

    using Function = void* (*)(void* argument);

    /// 0 or the `pthread_create` error.
    static int create_joinable(Thread& thread, Function function, void* argument);
    static int create_detached(Thread& thread, Function function, void* argument);
    /// Sets the result to null, then waits; the `pthread_join` error.
    static int join(const Thread& thread, void*& result);
    /// Ends the calling thread; its context runs the exit hook but is not released.
    [[noreturn]] static void exit(void* result);
    static Thread self();
    static bool equal(const Thread& a, const Thread& b);

private:
    /// The `pthread_t` lies in the first word; the rest stays zero.
    uint64 _opaque[4];
    static int _create(Thread& thread, Function function, void* argument, bool detached);
};

} // namespace KPRV

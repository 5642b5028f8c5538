#include "module/runtime/dispatch/Thread.h"
#include "module/runtime/dispatch/Thread_Context.h"
#include "module/runtime/system/assert.h"

#include <cstring>
#include <memory>

namespace KPRV {

static_assert(sizeof(pthread_t) <= sizeof(uint64));

struct Start_Record
{
    Thread::Function function;
    void* argument;
    Thread_Context* context;
};

static pthread_t handle_of(const uint64* opaque)
{
    pthread_t handle;
    memcpy(&handle, opaque, sizeof(handle));
    return handle;
}

static void* _thread_proc(void* data)
{
    // No guards here: a thread that ends by `Thread::exit` unwinds through this frame and keeps its context.
    Start_Record* const record = static_cast<Start_Record*>(data);
    const auto [function, argument, context] = *record;
    delete record;

    void* result;
    if (context) {
        Thread_Context::push(context);
        context->thread_start_hook();
        result = function(argument);
        context->thread_exit_hook();
    } else {
        result = function(argument);
    }

    CIMPLE_ASSERT(context == Thread_Context::top());
    if (Thread_Context* const top = Thread_Context::top()) {
        Thread_Context::pop();
        delete top;
    }
    return result;
}

Thread::Thread() : _opaque{} {}

Thread::Thread(const Thread& x) : _opaque{x._opaque[0]} {}

Thread& Thread::operator=(const Thread& x)
{
    _opaque[0] = x._opaque[0];
    return *this;
}

int Thread::create_joinable(Thread& thread, Function function, void* argument)
{
    return _create(thread, function, argument, false);
}

int Thread::create_detached(Thread& thread, Function function, void* argument)
{
    return _create(thread, function, argument, true);
}

int Thread::_create(Thread& thread, Function function, void* argument, bool detached)
{
    Thread_Context* const parent = Thread_Context::top();
    std::unique_ptr<Start_Record> record(new Start_Record{function, argument, nullptr});
    if (parent)
        record->context = static_cast<Thread_Context*>(parent->thread_create_hook(argument));

    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    pthread_attr_setdetachstate(&attributes, detached ? PTHREAD_CREATE_DETACHED : PTHREAD_CREATE_JOINABLE);
    pthread_t handle = {};
    const int status = pthread_create(&handle, &attributes, _thread_proc, record.get());
    pthread_attr_destroy(&attributes);

    if (status != 0) {
        // Settled: the parent's context goes here and stays on the parent's stack, while the new thread's
        // context is never released.
        delete parent;
        return status;
    }
    static_cast<void>(record.release()); // the new thread's
    memcpy(thread._opaque, &handle, sizeof(handle));
    return 0;
}

int Thread::join(const Thread& thread, void*& result)
{
    result = nullptr;
    return pthread_join(handle_of(thread._opaque), &result);
}

void Thread::exit(void* result)
{
    if (Thread_Context* const context = Thread_Context::top())
        context->thread_exit_hook();
    pthread_exit(result);
}

Thread Thread::self()
{
    Thread thread;
    const pthread_t handle = pthread_self();
    memcpy(thread._opaque, &handle, sizeof(handle));
    return thread;
}

bool Thread::equal(const Thread& a, const Thread& b)
{
    return a._opaque[0] == b._opaque[0];
}

} // namespace KPRV

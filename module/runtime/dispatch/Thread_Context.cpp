#include "module/runtime/dispatch/Thread_Context.h"

#include <pthread.h>

namespace KPRV {

static pthread_key_t _thread_context_key;
static pthread_once_t _thread_context_key_once = PTHREAD_ONCE_INIT;
static bool _thread_context_key_made;

static void _make_key()
{
    // No destructor function: the stack does not own its elements.
    _thread_context_key_made = pthread_key_create(&_thread_context_key, nullptr) == 0;
}

/// A process has about a thousand keys; a server that loads and unloads the module often must not run out of
/// them.
[[gnu::destructor(101)]] static void delete_key_at_unload()
{
    if (_thread_context_key_made)
        pthread_key_delete(_thread_context_key);
}

static pthread_key_t key()
{
    pthread_once(&_thread_context_key_once, _make_key);
    return _thread_context_key;
}

Thread_Context::~Thread_Context() = default;

Thread_Context* Thread_Context::top()
{
    return static_cast<Thread_Context*>(pthread_getspecific(key()));
}

void Thread_Context::push(Thread_Context* context)
{
    context->_next = top();
    pthread_setspecific(key(), context);
}

void Thread_Context::pop()
{
    if (Thread_Context* const context = top()) {
        pthread_setspecific(key(), context->_next);
        context->_next = nullptr;
    }
}

} // namespace KPRV

// The extension_table of operating system services: thin covers over POSIX threads.
#include "broker/Broker.h"

#include <bit>
#include <cstring>
#include <pthread.h>
#include <time.h>

namespace KPRV::broker {

namespace {

char* resolve_file_name(const char* base)
{
    return base ? strdup(("lib" + std::string(base) + ".so").c_str()) : nullptr;
}

void* as_handle(pthread_t thread)
{
    return std::bit_cast<void*>(thread);
}

pthread_t as_thread(void* handle)
{
    return std::bit_cast<pthread_t>(handle);
}

void* new_thread(CMPIThreadFunc start, void* parameter, int detached)
{
    pthread_t thread;
    if (pthread_create(&thread, nullptr, start, parameter))
        return nullptr;
    if (detached)
        pthread_detach(thread);
    return as_handle(thread);
}

int join_thread(void* thread, void** result)
{
    return pthread_join(as_thread(thread), result);
}

int exit_thread(void* result)
{
    pthread_exit(result);
}

int cancel_thread(void* thread)
{
    return pthread_cancel(as_thread(thread));
}

int thread_sleep(CMPIUint32 milliseconds)
{
    timespec span = {static_cast<time_t>(milliseconds / 1000),
                     static_cast<long>(milliseconds % 1000) * 1000000};
    return nanosleep(&span, nullptr);
}

/// The word is only a flag, so all callers share one lock; it is recursive, since a function may need another
/// one.
int thread_once(int* once, CMPIThreadOnceFunc function)
{
    static std::recursive_mutex mutex;
    std::lock_guard lock(mutex);
    if (!*once) {
        *once = 1;
        function();
    }
    return 0;
}

int create_thread_key(unsigned int* key, CMPIThreadKeyCleanupFunc cleanup)
{
    return pthread_key_create(key, cleanup);
}

int destroy_thread_key(unsigned int key)
{
    return pthread_key_delete(key);
}

void* get_thread_specific(unsigned int key)
{
    return pthread_getspecific(key);
}

int set_thread_specific(unsigned int key, void* value)
{
    return pthread_setspecific(key, value);
}

template <class Posix, auto Init>
void* new_primitive(int)
{
    auto* primitive = new Posix;
    Init(primitive, nullptr);
    return primitive;
}

template <class Posix, auto Destroy>
void destroy_primitive(void* primitive)
{
    auto* posix = static_cast<Posix*>(primitive);
    Destroy(posix);
    delete posix;
}

pthread_mutex_t* as_mutex(void* mutex)
{
    return static_cast<pthread_mutex_t*>(mutex);
}
pthread_cond_t* as_condition(void* condition)
{
    return static_cast<pthread_cond_t*>(condition);
}

void lock_mutex(void* mutex)
{
    pthread_mutex_lock(as_mutex(mutex));
}
void unlock_mutex(void* mutex)
{
    pthread_mutex_unlock(as_mutex(mutex));
}

int cond_wait(void* condition, void* mutex)
{
    return pthread_cond_wait(as_condition(condition), as_mutex(mutex));
}

int timed_cond_wait(void* condition, void* mutex, struct timespec* deadline)
{
    return pthread_cond_timedwait(as_condition(condition), as_mutex(mutex), deadline);
}

int signal_condition(void* condition)
{
    return pthread_cond_signal(as_condition(condition));
}

constexpr CMPIBrokerExtFT extension_level_100 = {CMPIVersion100,
                                                 resolve_file_name,
                                                 new_thread,
                                                 join_thread,
                                                 exit_thread,
                                                 cancel_thread,
                                                 thread_sleep,
                                                 thread_once,
                                                 create_thread_key,
                                                 destroy_thread_key,
                                                 get_thread_specific,
                                                 set_thread_specific,
                                                 new_primitive<pthread_mutex_t, pthread_mutex_init>,
                                                 destroy_primitive<pthread_mutex_t, pthread_mutex_destroy>,
                                                 lock_mutex,
                                                 unlock_mutex,
                                                 new_primitive<pthread_cond_t, pthread_cond_init>,
                                                 destroy_primitive<pthread_cond_t, pthread_cond_destroy>,
                                                 cond_wait,
                                                 timed_cond_wait,
                                                 signal_condition};

constexpr With_Null_Slots<CMPIBrokerExtFT, 4> extension_table = {extension_level_100, {}};

} // namespace

const CMPIBrokerExtFT* const broker_ext_table = &extension_table.table;

} // namespace KPRV::broker

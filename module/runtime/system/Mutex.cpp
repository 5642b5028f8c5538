#include "module/runtime/system/Mutex.h"
#include "module/runtime/system/assert.h"

#include <cerrno>

namespace KPRV {

Mutex::Mutex(bool recursive)
{
    if (!recursive) {
        pthread_mutex_init(&_mutex, nullptr);
        return;
    }
    pthread_mutexattr_t attributes;
    pthread_mutexattr_init(&attributes);
    pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_RECURSIVE);
    pthread_mutex_init(&_mutex, &attributes);
    pthread_mutexattr_destroy(&attributes);
}

Mutex::~Mutex()
{
    pthread_mutex_destroy(&_mutex);
}

void Mutex::lock()
{
    // The words of this assertion are fixed; they do not follow the members of the class.
    if (pthread_mutex_lock(&_mutex) != 0)
        __cimple_assert(__FILE__, __LINE__, __func__, "pthread_mutex_lock(&((MutexRep*)_rep)->mutex) == 0");
}

int Mutex::try_lock()
{
    switch (pthread_mutex_trylock(&_mutex)) {
    case 0:
        return 0;
    case EBUSY:
        return EBUSY;
    default:
        return -1;
    }
}

void Mutex::unlock()
{
    pthread_mutex_unlock(&_mutex);
}

} // namespace KPRV

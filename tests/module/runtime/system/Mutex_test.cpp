#include "module/runtime/system/Mutex.h"

#include <atomic>
#include <cerrno>
#include <gtest/gtest.h>
#include <thread>

using namespace KPRV;

static int try_on_another_thread(Mutex& mutex)
{
    int result = 0;
    std::thread([&] {
        result = mutex.try_lock();
        if (result == 0)
            mutex.unlock();
    }).join();
    return result;
}

TEST(Mutex, RecursiveOneIsTakenAgainByItsOwner)
{
    Mutex mutex(true);
    mutex.lock();
    EXPECT_EQ(mutex.try_lock(), 0);
    mutex.unlock();
    EXPECT_EQ(try_on_another_thread(mutex), 16);
    mutex.unlock();
    EXPECT_EQ(try_on_another_thread(mutex), 0);
}

TEST(Mutex, PlainOneIsBusyForItsOwnerToo)
{
    static_assert(EBUSY == 16);
    Mutex mutex(false);
    EXPECT_EQ(mutex.try_lock(), 0);
    EXPECT_EQ(mutex.try_lock(), 16);
    EXPECT_EQ(try_on_another_thread(mutex), 16);
    mutex.unlock();
    EXPECT_EQ(try_on_another_thread(mutex), 0);
}

TEST(Mutex, GuardHoldsItForAScope)
{
    Mutex mutex;
    {
        const Auto_Mutex guard(mutex);
        EXPECT_EQ(try_on_another_thread(mutex), 16);
    }
    EXPECT_EQ(try_on_another_thread(mutex), 0);
}

TEST(Mutex, KeepsThreadsApart)
{
    Mutex mutex;
    int count = 0;
    const auto work = [&] {
        for (int i = 0; i < 10000; i++) {
            const Auto_Mutex guard(mutex);
            count++;
        }
    };
    std::thread a(work), b(work);
    a.join();
    b.join();
    EXPECT_EQ(count, 20000);
}

#if !defined(__SANITIZE_THREAD__)
/// A mutex that the library does not recognise: its operations fail.
static void spoil(Mutex& mutex)
{
    reinterpret_cast<pthread_mutex_t*>(&mutex)->__data.__kind = 15;
}

TEST(Mutex, OtherFailuresOfTryLockAreMinusOne)
{
    Mutex mutex;
    spoil(mutex);
    EXPECT_EQ(mutex.try_lock(), -1);
}

TEST(Mutex, FailureOfLockIsFatal)
{
    Mutex mutex;
    spoil(mutex);
    EXPECT_EXIT(mutex.lock(), testing::KilledBySignal(SIGABRT),
                "lock\\(\\): assert: pthread_mutex_lock\\(&\\(\\(MutexRep\\*\\)_rep\\)->mutex\\) == 0\n\n$");
}
#endif

#include "runtime/Time.h"

#include <cerrno>
#include <ctime>
#include <sys/select.h>
#include <sys/time.h>

namespace KPRV::Time {

uint64 now()
{
    timeval tv;
    gettimeofday(&tv, nullptr);
    return uint64(tv.tv_sec) * SEC + uint64(tv.tv_usec);
}

void sleep(uint64 microseconds)
{
    timeval tv;
    tv.tv_sec = time_t(microseconds / SEC);
    tv.tv_usec = suseconds_t(microseconds % SEC);
    select(0, nullptr, nullptr, nullptr, &tv);
}

uint64 monotonic()
{
    timespec time;
    clock_gettime(CLOCK_MONOTONIC, &time);
    return uint64(time.tv_sec) * SEC + uint64(time.tv_nsec) / 1000;
}

void sleep_until(uint64 moment)
{
    timespec time;
    time.tv_sec = time_t(moment / SEC);
    time.tv_nsec = long(moment % SEC) * 1000;
    while (clock_nanosleep(CLOCK_MONOTONIC, TIMER_ABSTIME, &time, nullptr) == EINTR) {
    }
}

} // namespace KPRV::Time

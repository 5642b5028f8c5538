#include "module/runtime/system/Time.h"

#include <cerrno>
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
    // The system leaves in the record what a signal has kept from being slept.
    while (select(0, nullptr, nullptr, nullptr, &tv) == -1 && errno == EINTR) {
    }
}

} // namespace KPRV::Time

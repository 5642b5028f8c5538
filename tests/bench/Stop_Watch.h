#pragma once

#include <algorithm>
#include <ctime>
#include <vector>

namespace KPRV::bench {

/// Nanoseconds of a clock since the watch was made.
class Stop_Watch
{
public:
    explicit Stop_Watch(clockid_t clock = CLOCK_MONOTONIC) : _clock(clock), _start(now()) {}
    double passed() const { return now() - _start; }

private:
    double now() const
    {
        timespec time;
        clock_gettime(_clock, &time);
        return double(time.tv_sec) * 1e9 + double(time.tv_nsec);
    }

    clockid_t _clock;
    double _start;
};

inline double median(std::vector<double> values)
{
    std::ranges::sort(values);
    return values.empty() ? 0 : values[values.size() / 2];
}

} // namespace KPRV::bench

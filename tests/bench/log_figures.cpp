#include "module/runtime/system/log.h"
#include "tests/bench/Figures.h"
#include "tests/bench/Stop_Watch.h"

#include <cstdio>

namespace KPRV::bench {

void print_log_figure(const char* name, bool tiny)
{
    const int rounds = tiny ? 3 : 25, lines = tiny ? 100 : 20000;
    close_log();
    std::vector<double> times;
    for (int round = 0; round < rounds; round++) {
        const Stop_Watch watch(CLOCK_THREAD_CPUTIME_ID);
        for (int i = 0; i < lines; i++)
            LOG(DBG, "numOfPorts = %d", i);
        times.push_back(watch.passed() / lines);
    }
    printf("%s\t%.1f\tns\n", name, median(times));
    close_log();
}

} // namespace KPRV::bench

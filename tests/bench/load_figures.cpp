#include "tests/bench/Figures.h"
#include "tests/bench/Lean_Broker.h"
#include "tests/bench/Libraries.h"
#include "tests/bench/Stop_Watch.h"

#include <cstdio>
#include <cstdlib>
#include <string>

namespace KPRV::bench {

void print_first_answer()
{
    Lean_Broker& server = Lean_Broker::get();
    Fast_Library::get().prepare({.adapters = 1, .ports = 2});
    const Stop_Watch watch;
    CMPIInstanceMI* const mi = Module::get().instances("KALDERA_FCPort");
    mi->ft->enumerateInstances(mi, server.context(), server.result(), server.path("KALDERA_FCPort"), nullptr);
    printf("%.0f %zu\n", watch.passed(), server.delivered());
}

void print_load_figures(const char* program, bool tiny)
{
    std::vector<double> times;
    for (int round = 0; round < (tiny ? 1 : 25); round++) {
        double nanoseconds = 0;
        unsigned delivered = 0;
        FILE* const child = popen(("'" + std::string(program) + "' --first-answer").c_str(), "r");
        if (!child || fscanf(child, "%lf %u", &nanoseconds, &delivered) != 2 || delivered != 2) {
            fputs("bench: the first answer did not come\n", stderr);
            exit(1);
        }
        pclose(child);
        times.push_back(nanoseconds / 1e6);
    }
    printf("B5 load to first answer\t%.2f\tms\n", median(times));
}

} // namespace KPRV::bench

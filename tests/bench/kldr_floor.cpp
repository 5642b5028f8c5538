#include "tests/bench/Floor_Row.h"
#include "tests/bench/Home_Folder.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <ctime>

#if __has_include(<valgrind/callgrind.h>)
#include <valgrind/callgrind.h>
#else
// The program runs, but nothing is counted.
#define CALLGRIND_START_INSTRUMENTATION
#define CALLGRIND_STOP_INSTRUMENTATION
#endif

using namespace KPRV::bench;

namespace {

/// So often is a request made before it counts: what is kept between requests then lies as it will.
constexpr int WARM_UP = 2;

Floor_Row::Request made(const Floor_Row::Maker& maker)
{
    Lean_Broker::get().begin_call();
    return maker(Lean_Broker::get());
}

void count(const Floor_Row::Maker& maker, int times)
{
    for (int i = 0; i < WARM_UP; i++)
        made(maker)();
    for (int i = 0; i < times; i++) {
        const Floor_Row::Request request = made(maker);
        // What is not counted runs at a tenth of the cost.
        CALLGRIND_START_INSTRUMENTATION;
        request();
        CALLGRIND_STOP_INSTRUMENTATION;
    }
}

long nanoseconds()
{
    timespec now;
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return now.tv_sec * 1000000000L + now.tv_nsec;
}

long time_of(const Floor_Row::Maker& maker)
{
    const Floor_Row::Request request = made(maker);
    const long begin = nanoseconds();
    request();
    return nanoseconds() - begin;
}

/// The medians of both sides, which run by turns.
void take_times(const Floor_Row::Maker& ours, const Floor_Row::Maker& floor, int times)
{
    std::vector<long> of_ours, of_floor;
    for (int i = 0; i < WARM_UP + times; i++) {
        const long our_time = time_of(ours), floor_time = time_of(floor);
        if (i < WARM_UP)
            continue;
        of_ours.push_back(our_time);
        of_floor.push_back(floor_time);
    }
    const auto median = [](std::vector<long>& of) {
        std::ranges::sort(of);
        return of[of.size() / 2];
    };
    printf("%ld\t%ld\n", median(of_ours), median(of_floor));
}

/// kldr_floor [--tiny]                              the names of the rows, each looked through once with
/// --tiny kldr_floor [--tiny] ROW ours|floor [TIMES]       the request of a row, or its floor kldr_floor
/// [--tiny] ROW times [TIMES]            both by turns; prints nanoseconds, the request's and the floor's
int run(const std::vector<std::string>& words, bool tiny)
{
    const std::vector<Floor_Row> rows = floor_rows(tiny);
    if (words.empty()) {
        for (const Floor_Row& row : rows) {
            puts(row.name.c_str());
            if (!tiny)
                continue;
            row.prepare();
            take_times(row.ours, floor_of(row), 1);
        }
        return 0;
    }
    const auto row = std::ranges::find(rows, words[0], &Floor_Row::name);
    if (row == rows.end() || words.size() < 2) {
        fputs("usage: kldr_floor [--tiny] [ROW ours|floor|times [TIMES]]\n", stderr);
        return 2;
    }
    const int times = words.size() > 2 ? atoi(words[2].c_str()) : 1;
    row->prepare();
    const Floor_Row::Maker floor = floor_of(*row);
    if (words[1] == "times")
        take_times(row->ours, floor, times);
    else
        count(words[1] == "ours" ? row->ours : floor, times);
    return 0;
}

} // namespace

int main(int argc, char** argv)
{
    const bool tiny = argc > 1 && std::string_view(argv[1]) == "--tiny";
    const Home_Folder home("LOG_LEVEL=ERR\n");
    serve_instances();
    return run({argv + 1 + tiny, argv + argc}, tiny);
}

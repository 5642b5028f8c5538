#include "tests/bench/Twins.h"

#include "tests/bench/Allocation_Count.h"

#include <benchmark/benchmark.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>

namespace KPRV::bench {

namespace {

std::vector<std::string> answers(const Twins::Call& call)
{
    Lean_Broker& server = Lean_Broker::get();
    server.begin_call(true);
    call(server);
    return server.texts();
}

void measure(benchmark::State& state, const std::function<void()>& prepare, const Twins::Call& call)
{
    Lean_Broker& server = Lean_Broker::get();
    prepare();
    const auto once = [&] {
        server.begin_call();
        call(server);
    };
    once();
    const Allocations before = allocations();
    once();
    const Allocations after = allocations();
    for (auto _ : state)
        once();

    const double delivered = double(std::max<size_t>(server.delivered(), 1));
    state.counters["delivered"] = delivered;
    state.counters["allocations"] = double(after.calls - before.calls) / delivered;
    state.counters["bytes"] = double(after.bytes - before.bytes) / delivered;
}

} // namespace

void check_equal(const Twins& twins)
{
    twins.prepare();
    const std::vector<std::string> ours = answers(twins.ours);
    const std::vector<std::string> plain = answers(twins.plain);
    const auto [own, other] = std::ranges::mismatch(ours, plain);
    if (own == ours.end() && other == plain.end())
        return;
    fprintf(stderr, "bench: %s: %zu and %zu answers differ\nours:  %s\nplain: %s\n", twins.name.c_str(),
            ours.size(), plain.size(), own == ours.end() ? "(end)" : own->c_str(),
            other == plain.end() ? "(end)" : other->c_str());
    exit(1);
}

void add(const Twins& twins)
{
    const auto add_one = [&](const char* side, const Twins::Call& call) {
        auto* const added =
            benchmark::RegisterBenchmark((twins.name + "/" + side).c_str(), measure, twins.prepare, call);
        if (twins.slow)
            added->Iterations(1);
        if (twins.wall_clock)
            added->UseRealTime();
    };
    add_one("ours", twins.ours);
    add_one("plain", twins.plain);
}

} // namespace KPRV::bench

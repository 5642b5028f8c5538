#include "tests/bench/Home_Folder.h"
#include "tests/bench/Twins.h"

#include <benchmark/benchmark.h>

#include <cstring>

using namespace KPRV::bench;

/// kldr_bench [--tiny] [options of the benchmark library]
int main(int argc, char** argv)
{
    const bool tiny = argc > 1 && strcmp(argv[1], "--tiny") == 0;
    // The module finds its log's settings there; without them it would look for them with every line.
    const Home_Folder home("LOG_LEVEL=ERR\n");
    benchmark::Initialize(&argc, argv);
    add_instances(tiny);
    add_paths(tiny);
    add_controlled_by(tiny);
    add_tunnel(tiny);
    add_agent_detection(tiny);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}

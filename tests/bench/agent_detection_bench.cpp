#include "module/adapter/ProviderUtil.h"
#include "tests/bench/Twins.h"

#include <benchmark/benchmark.h>

#include <cstdio>
#include <cstdlib>

namespace KPRV::bench {

/// What the detection answers, by the shell: the process list, searched for a name at the end of a line.
static int agent_port_by_shell()
{
    constexpr int AGENT_PORT = 34568;
    char line[128];
    FILE* const list = popen("ps -e | grep qxmagent$", "r");
    if (!list)
        return 0;
    const bool found = fgets(line, sizeof line, list) != nullptr;
    pclose(list);
    return found ? AGENT_PORT : 0;
}

void add_agent_detection(bool)
{
    const Twins twins = {
        .name = "B5 find the agent's process",
        .prepare = [] {},
        .ours = [](Lean_Broker&) { benchmark::DoNotOptimize(ProviderUtil::getAgentPort()); },
        .plain = [](Lean_Broker&) { benchmark::DoNotOptimize(agent_port_by_shell()); },
        .wall_clock = true,
    };
    if (ProviderUtil::getAgentPort() != agent_port_by_shell()) {
        fputs("bench: the shell finds another agent\n", stderr);
        exit(1);
    }
    add(twins);
}

} // namespace KPRV::bench

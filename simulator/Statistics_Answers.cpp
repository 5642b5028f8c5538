// Behaviours of counters: read, and set back.
#include "simulator/Behaviours.h"
#include "simulator/Lookup.h"

namespace KPRV::simulator {

Json::Value port_counters(State& state, const Json::Value& request)
{
    return answer_for_fc_port(state, request["indexStr"],
                              [](const Port& port) { return port.counters.answer(); });
}

Json::Value reset_port_counters(State& state, const Json::Value& request)
{
    return answer_for_fc_port(state, request["indexStr"], [](Port& port) {
        port.counters.reset();
        return done_answer();
    });
}

Json::Value statistics_answer(State& state, const Json::Value& request, Statistics kind)
{
    return answer_for_target(state, request, statistics_kind(kind).scope, [&](const Target& target) {
        return counters_at(state.inventory, kind, target.path);
    });
}

Json::Value reset_statistics_answer(State& state, const Json::Value& request, Statistics kind)
{
    return answer_for_target(state, request, statistics_kind(kind).scope, [&](const Target& target) {
        state.inventory.reset_marks.reset(statistics_kind(kind).group, target.path);
        return done_answer();
    });
}

} // namespace KPRV::simulator

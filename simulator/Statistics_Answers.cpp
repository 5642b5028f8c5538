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

} // namespace KPRV::simulator

#include "simulator/Address.h"
#include "simulator/Behaviours.h"
#include "simulator/Lookup.h"

namespace KPRV::simulator {

namespace {

// The simulator has no virtual ports: the logical port is always the physical one.
template <typename Answer>
Json::Value answer_for_logical_port(State& state, const Json::Value& request, Answer answer)
{
    return answer_for_fc_port(state, request["pPortWwn"], [&](const Port& port) {
        const Json::Value& logical = request["lPortWwn"];
        const bool same = lower_case(logical.asString()) == lower_case(port.address);
        return same ? answer(port) : no_such_address(logical);
    });
}

template <typename Answer>
Json::Value answer_for_remote_port(State& state, const Json::Value& request, Answer answer)
{
    return answer_for_logical_port(state, request, [&](const Port& port) {
        const Json::Value& address = request["rPortWwn"];
        const auto remote = port.remote_ports.find(address.asString());
        return remote ? answer(*remote) : no_such_address(address);
    });
}

} // namespace

Json::Value remote_ports(State& state, const Json::Value& request)
{
    return answer_for_logical_port(state, request, [](const Port& port) { return port.remote_ports.list(); });
}

Json::Value remote_port_data(State& state, const Json::Value& request)
{
    return answer_for_remote_port(state, request, [](const Remote_Port& remote) { return remote.complete; });
}

Json::Value remote_port_luns(State& state, const Json::Value& request)
{
    return answer_for_remote_port(state, request, [](const Remote_Port& remote) {
        return remote.complete.get("lunList", Json::Value(Json::arrayValue));
    });
}

} // namespace KPRV::simulator

// Behaviours of what a port sees: remote ports, and their LUNs.
#include "simulator/Behaviours.h"
#include "simulator/Target.h"

namespace KPRV::simulator {

// A virtual port sees what its physical port sees.

Json::Value remote_ports(State& state, const Json::Value& request)
{
    Json::Value port;
    for (const char* name : {"pPortWwn", "lPortWwn"})
        port[name] = request[name];
    return answer_for_target(state, port, Scope::FC_PORT,
                             [](const Target& target) { return target.port->remote_ports.list(); });
}

Json::Value remote_port_data(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::FC_PORT,
                             [](const Target& target) { return target.remote_port->complete; });
}

Json::Value remote_port_luns(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::FC_PORT, [](const Target& target) {
        return target.remote_port->complete.get("lunList", Json::Value(Json::arrayValue));
    });
}

} // namespace KPRV::simulator

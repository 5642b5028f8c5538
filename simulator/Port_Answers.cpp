// Behaviours of physical ports, FC and Ethernet: addresses, data, state, what can be set.
#include "simulator/Behaviours.h"
#include "simulator/Inventory_Members.h"
#include "simulator/Lookup.h"
#include "simulator/State_Events.h"
#include "simulator/Status.h"
#include "simulator/Target.h"

#include <algorithm>

namespace KPRV::simulator {

namespace {

Json::Value port_addresses(State& state, const Json::Value& request, std::vector<Port> Adapter::*ports)
{
    const Json::Value& address = request["indexStr"];
    return answer_at(state.inventory.adapter_at(address.asString()), address,
                     [&](const Inventory::Place& place) {
                         Json::Value answer;
                         answer["indexStrings"] = Json::Value(Json::arrayValue);
                         for (const Port& port : place.adapter->*ports)
                             answer["indexStrings"].append(port.address);
                         return answer;
                     });
}

// Null if there is none of that name.
const Member* find_member(Members members, const Json::Value& name)
{
    const auto found =
        std::find_if(members.begin(), members.end(), [&](const Member& each) { return name == each.name; });
    return found == members.end() ? nullptr : &*found;
}

// The first of the names that cannot be set, in words; empty if all can. `strict`: only members can.
std::string objection(const Json::Value& names, const Json::Value& values, Members members, bool strict)
{
    if (!names.isArray() || !values.isObject())
        return "port must be an object and propArray an array";
    for (const Json::Value& name : names) {
        if (!name.isString() || !values.isMember(name.asString()))
            return "propArray names what port does not have: " + compact_text(name);
        const Member* member = find_member(members, name);
        if (member ? !has_type(values[name.asString()], member->type) : strict)
            return name.asString() +
                   (member ? std::string(" must be ") + type_words(member->type) : " cannot be set");
    }
    return "";
}

// What can be set of an Ethernet function: of its link and of its data.
constexpr Member settable_eth_members[] = {
    {"portStatus", Type::BOOL, Presence::OPTIONAL},
    {"beaconState", Type::BOOL, Presence::OPTIONAL},
    {"mtu", Type::COUNT, Presence::OPTIONAL},
};

Occurrence switched(const Port& port, bool enabled)
{
    if (port.kind == Port_Kind::FC)
        return enabled ? Occurrence::FC_PORT_ENABLED : Occurrence::FC_PORT_DISABLED;
    return enabled ? Occurrence::ETHERNET_PORT_ENABLED : Occurrence::ETHERNET_PORT_DISABLED;
}

// A port that is enabled or disabled shows it in each member that tells its state, and tells it if it is a
// change.
void show_status(State& state, Port& port, bool was_enabled)
{
    const bool enabled = port.data["portStatus"].asBool();
    const Status status = enabled ? IN_SERVICE : STOPPED;
    port.data["portStatusValue"] = status;
    if (!port.eth_data.isNull())
        port.eth_data["ethPortStateMOFValue"] = status;
    if (enabled != was_enabled)
        occur(state, switched(port, enabled), port);
}

bool has_name(const Json::Value& names, const char* name)
{
    return std::find(names.begin(), names.end(), name) != names.end();
}

} // namespace

Json::Value fc_port_addresses(State& state, const Json::Value& request)
{
    return port_addresses(state, request, &Adapter::fc_ports);
}

Json::Value eth_port_addresses(State& state, const Json::Value& request)
{
    return port_addresses(state, request, &Adapter::eth_ports);
}

Json::Value port_data(State& state, const Json::Value& request)
{
    return answer_for_port(state, wwn_or_mac(request), [](const Port& port) { return port.data; });
}

Json::Value eth_port_data(State& state, const Json::Value& request)
{
    Inventory::Place place = state.inventory.port_at(request["mac"].asString());
    if (place && place.port->eth_data.isNull())
        place = {};
    return answer_at(place, request["mac"], [](const Inventory::Place& found) {
        Json::Value answer;
        answer["ethData"] = found.port->eth_data;
        return answer;
    });
}

Json::Value set_port(State& state, const Json::Value& request)
{
    const Json::Value& names = request["propArray"];
    const Json::Value& values = request["port"];
    const std::string refused = objection(names, values, fc_port_members, false);
    if (!refused.empty())
        return error_answer(Error_Code::REQUEST, refused);
    return answer_for_port(state, request["indexStr"], [&](Port& port) {
        const bool was_enabled = port.data["portStatus"].asBool();
        for (const Json::Value& name : names)
            port.data[name.asString()] = values[name.asString()];
        if (has_name(names, "portStatus"))
            show_status(state, port, was_enabled);
        return done_answer();
    });
}

Json::Value set_eth_port(State& state, const Json::Value& request)
{
    const Json::Value& names = request["propArray"];
    const Json::Value& values = request["ethPort"];
    const std::string refused = objection(names, values, settable_eth_members, true);
    if (!refused.empty())
        return error_answer(Error_Code::REQUEST, refused);
    return answer_for_target(state, request, Scope::ETH_PORT, [&](const Target& target) {
        Port& port = *target.port;
        if (port.eth_data.isNull())
            return no_such_address(request["mac"]);
        const bool was_enabled = port.data["portStatus"].asBool();
        for (const Json::Value& name : names)
            (name == "mtu" ? port.eth_data : port.data)[name.asString()] = values[name.asString()];
        if (has_name(names, "portStatus"))
            show_status(state, port, was_enabled);
        return done_answer();
    });
}

// The logs themselves are nowhere to be read.
Json::Value clear_logs(State& state, const Json::Value& request)
{
    const Json::Value& addresses = request["propArray"];
    if (!addresses.isArray())
        return error_answer(Error_Code::REQUEST, "propArray must be an array");
    for (const Json::Value& address : addresses)
        if (const Target target = target_at(state.inventory, address, Scope::PORT); !target)
            return target.refusal;
    return done_answer();
}

} // namespace KPRV::simulator

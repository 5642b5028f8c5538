// Behaviours of virtual FC ports: made, read, removed.
#include "simulator/Address.h"
#include "simulator/Behaviours.h"
#include "simulator/Lookup.h"
#include "simulator/State_Events.h"
#include "simulator/Status.h"
#include "simulator/Target.h"

#include <algorithm>
#include <set>

namespace KPRV::simulator {

namespace {

constexpr std::size_t MOST_VIRTUAL_PORTS = 255;

bool is_taken(Inventory& inventory, const std::string& address)
{
    if (inventory.port_at(address) || inventory.adapter_at(address))
        return true;
    for (const Adapter& adapter : inventory.adapters)
        for (const Port& port : adapter.fc_ports)
            for (const Virtual_Port& each : port.virtual_ports)
                if (lower_case(each.address) == lower_case(address))
                    return true;
    return false;
}

Virtual_Port new_virtual_port(const Json::Value& request)
{
    Virtual_Port port;
    port.address = request["vwwn"].asString();
    port.data["portWwn"] = request["vwwn"];
    port.data["nodeWwn"] = request["nwwn"];
    port.data["symbolicName"] = request["symbolicName"];
    port.data["vfId"] = 0;
    port.data["portStatus"] = true;
    port.data["portStatusValue"] = IN_SERVICE;
    return port;
}

// Why the request cannot become a virtual port of the target; null if it can.
Json::Value objection(State& state, const Json::Value& request, const Target& target)
{
    for (const char* name : {"vwwn", "nwwn"})
        if (!has_type(request[name], Type::WWN))
            return error_answer(Error_Code::REQUEST, name + std::string(" must be ") + type_words(Type::WWN));
    if (!request["symbolicName"].isString())
        return error_answer(Error_Code::REQUEST, "symbolicName must be a text");
    if (is_taken(state.inventory, request["vwwn"].asString()))
        return error_answer(Error_Code::DUPLICATE, "address in use: " + compact_text(request["vwwn"]));
    if (target.port->virtual_ports.size() >= MOST_VIRTUAL_PORTS)
        return error_answer(Error_Code::CONFLICT, "the port has all the virtual ports that it can have");
    return {};
}

// With all that was said of it and of what lies behind it.
void remove_virtual_port(Port& port, const std::string& path, const std::string& address)
{
    const std::string below = path_below(path, address);
    port.lun_masks.remove_below(below);
    port.io_profiles.remove_below(below);
    std::erase_if(port.virtual_ports,
                  [&](const Virtual_Port& each) { return lower_case(each.address) == address; });
}

// A request as find_target reads it, with `logical` for the virtual port.
Json::Value addressed(const Json::Value& request, const Json::Value& logical)
{
    Json::Value address;
    address["pwwn"] = request["pwwn"];
    address["vfId"] = request["vfId"];
    if (!logical.isNull())
        address["vwwn"] = logical;
    return address;
}

} // namespace

Json::Value virtual_ports(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::FC_PORT, [](const Target& target) {
        Json::Value answer(Json::arrayValue);
        for (const Virtual_Port& each : target.port->virtual_ports)
            answer.append(each.data);
        return answer;
    });
}

Json::Value virtual_port_data(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::VIRTUAL_PORT,
                             [](const Target& target) { return target.virtual_port->data; });
}

Json::Value create_virtual_port(State& state, const Json::Value& request)
{
    const Json::Value port = addressed(request, Json::Value());
    return answer_for_target(state, port, Scope::FC_PORT, [&](const Target& target) {
        Json::Value refusal = objection(state, request, target);
        if (!refusal.isNull())
            return refusal;
        target.port->virtual_ports.push_back(new_virtual_port(request));
        state.inventory.reset_marks.start_anew(
            path_below(target.path, lower_case(request["vwwn"].asString())));
        occur(state, Occurrence::LOGICAL_PORT_CREATED, *target.port, request["vwwn"].asString());
        return done_answer();
    });
}

Json::Value delete_virtual_ports(State& state, const Json::Value& request)
{
    const Json::Value& doomed = request["vportArray"];
    if (!doomed.isArray())
        return error_answer(Error_Code::REQUEST, "vportArray must be an array");
    const Json::Value port = addressed(request, Json::Value());
    return answer_for_target(state, port, Scope::FC_PORT, [&](const Target& target) {
        std::set<std::string> seen;
        for (const Json::Value& each : doomed) {
            const Json::Value logical = each.isString() ? each : Json::Value("");
            if (!find_target(state.inventory, addressed(request, logical), Scope::VIRTUAL_PORT) ||
                !seen.insert(lower_case(logical.asString())).second)
                return error_answer(Error_Code::NOT_FOUND, "no such virtual port: " + compact_text(each));
        }
        for (const Json::Value& each : doomed) {
            remove_virtual_port(*target.port, target.path, lower_case(each.asString()));
            occur(state, Occurrence::LOGICAL_PORT_DELETED, *target.port, each.asString());
        }
        return done_answer();
    });
}

} // namespace KPRV::simulator

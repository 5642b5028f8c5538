#include "simulator/Target.h"

#include "simulator/Address.h"
#include "simulator/Lookup.h"

#include <algorithm>

namespace KPRV::simulator {

namespace {

// The names under which requests have an address, by what it is that of.
constexpr const char* physical_names[] = {"indexStr", "wwn", "mac", "pwwn", "pPortWwn", "portWwn"};
constexpr const char* logical_names[] = {"lPortWwn", "lwwn", "vwwn"};
constexpr const char* fabric_names[] = {"vfId", "vfID"};

// The first of the names that the request has, or null.
template <typename Names>
const Json::Value& named(const Json::Value& request, const Names& names)
{
    for (const char* name : names)
        if (request.isMember(name))
            return request[name];
    return Json::Value::nullSingleton();
}

std::string text_of(const Json::Value& value)
{
    return value.isString() ? value.asString() : "";
}

bool is_fcoe(const Port& port)
{
    return port.data["isFCoE"].isBool() && port.data["isFCoE"].asBool();
}

// The FCoE function beside an Ethernet function; a port of another kind is given back.
Port* fcoe_function(const Inventory::Place& place)
{
    if (!place.port || place.port->kind == Port_Kind::FC)
        return place.port;
    const auto index = static_cast<std::size_t>(place.port - place.adapter->eth_ports.data());
    return index < place.adapter->fc_ports.size() ? &place.adapter->fc_ports[index] : nullptr;
}

// The virtual NIC that has the MAC; nothing if none has.
Target virtual_nic(Inventory& inventory, const std::string& mac)
{
    Target target;
    for (Adapter& adapter : inventory.adapters)
        for (Port& port : adapter.eth_ports)
            for (const Virtual_Nic& nic : port.vnics)
                if (nic.mac == lower_case(mac)) {
                    target.adapter = &adapter;
                    target.port = &port;
                    target.vnic = &nic;
                }
    return target;
}

Target physical_target(Inventory& inventory, const std::string& address, Scope scope)
{
    Target target;
    Inventory::Place place = inventory.port_at(address);
    if (scope == Scope::ADAPTER || (scope == Scope::ADAPTER_OR_PORT && !place))
        place = inventory.adapter_at(address);
    target.adapter = place.adapter;
    target.port = scope == Scope::FCOE_PORT ? fcoe_function(place) : place.port;
    switch (scope) {
    case Scope::ADAPTER:
    case Scope::ADAPTER_OR_PORT:
        target.port = nullptr;
        return target;
    case Scope::PORT:
        break;
    case Scope::FC_PORT:
    case Scope::VIRTUAL_PORT:
        if (target.port && target.port->kind != Port_Kind::FC)
            target.port = nullptr;
        break;
    case Scope::FCOE_PORT:
        if (target.port && !is_fcoe(*target.port))
            target.port = nullptr;
        break;
    case Scope::VNIC:
        if (!target.port)
            return virtual_nic(inventory, address);
        [[fallthrough]];
    case Scope::ETH_PORT:
        if (target.port && target.port->kind != Port_Kind::ETHERNET)
            target.port = nullptr;
        break;
    }
    if (!target.port)
        target.adapter = nullptr;
    return target;
}

// True if the request's logical port is this port or a virtual port of it.
bool follow_logical(Target& target, const std::string& address, Scope scope)
{
    const std::string wanted = lower_case(address);
    target.path = path_below(target.path, wanted);
    for (const Virtual_Port& each : target.port->virtual_ports)
        if (lower_case(each.address) == wanted)
            target.virtual_port = &each;
    return target.virtual_port ||
           (scope != Scope::VIRTUAL_PORT && wanted == lower_case(target.port->address));
}

// LUN numbers are texts in some requests and numbers in others.
bool follow_lun(Target& target, const Json::Value& number)
{
    const std::string wanted = number.isString() || number.isInt() ? number.asString() : "";
    target.path = path_below(target.path, wanted);
    for (const Json::Value& each : target.remote_port->complete["lunList"])
        if (each["number"].isUInt() && std::to_string(each["number"].asUInt()) == wanted)
            target.lun = &each;
    return target.lun != nullptr;
}

// The first address that leads nowhere, in words; empty if all lead on.
std::string follow(Target& target, const Json::Value& request, Scope scope)
{
    const Json::Value& logical = named(request, logical_names);
    const Json::Value& remote = request["rPortWwn"];
    const bool has_lun = request.isMember("lunId");
    const bool behind_port = !logical.isNull() || !remote.isNull() || has_lun;
    if (!behind_port)
        return "";
    if (!target.port || target.port->kind != Port_Kind::FC)
        return "no such address: " + compact_text(logical);
    const std::string logical_address = logical.isNull() ? target.port->address : text_of(logical);
    if (!follow_logical(target, logical_address, scope))
        return "no such address: " + compact_text(logical);
    if (!remote.isNull()) {
        target.path = path_below(target.path, lower_case(text_of(remote)));
        target.remote_port = target.port->remote_ports.find(text_of(remote));
        if (!target.remote_port)
            return "no such address: " + compact_text(remote);
    }
    if (has_lun && (!target.remote_port || !follow_lun(target, request["lunId"])))
        return "no such LUN: " + compact_text(request["lunId"]);
    return "";
}

} // namespace

Target find_target(Inventory& inventory, const Json::Value& request, Scope scope)
{
    const Json::Value& address = named(request, physical_names);
    Target target = physical_target(inventory, text_of(address), scope);
    const Json::Value& fabric = named(request, fabric_names);
    if (!target.adapter)
        target.refusal = no_such_address(address);
    else if (!fabric.isNull() && fabric != Json::Value(0))
        target.refusal = error_answer(Error_Code::ADDRESS, "no such virtual fabric: " + compact_text(fabric));
    if (!target)
        return target;
    target.path = lower_case(target.vnic   ? target.vnic->mac
                             : target.port ? target.port->address
                                           : target.adapter->address);
    const std::string nowhere = follow(target, request, scope);
    if (!nowhere.empty())
        target.refusal = error_answer(Error_Code::ADDRESS, nowhere);
    return target;
}

Target target_at(Inventory& inventory, const Json::Value& address, Scope scope)
{
    Json::Value request;
    request["indexStr"] = address;
    return find_target(inventory, request, scope);
}

std::string path_below(const std::string& path, const std::string& name)
{
    return path + "/" + name;
}

bool is_at_or_below(const std::string& path, const std::string& above)
{
    return path == above || path.starts_with(above + "/");
}

} // namespace KPRV::simulator

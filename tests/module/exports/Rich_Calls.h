#pragma once

#include "simulator/Simulator_Control.h"

#include <functional>
#include <map>
#include <string>
#include <vector>

// What the host of rich.json is asked for, call by call. The walks stand here as the library sees them, so
// that a call too many, one too few, one too early or one about the wrong thing all show.

namespace KPRV::rich {

/// Calls as "entry_point member=value ...", members in the order of their names.
using Calls = std::vector<std::string>;

inline Calls recorded(simulator::Simulator_Control& simulator)
{
    Calls calls;
    for (const simulator::Simulator_Call& call : simulator.calls()) {
        std::string text = call.name;
        if (call.request.isObject()) {
            for (const std::string& member : call.request.getMemberNames())
                text += " " + member + "=" + call.request[member].asString();
        }
        calls.push_back(text);
    }
    return calls;
}

struct Fc_Port
{
    std::string wwn;
    std::vector<std::string> remote_ports;
};

struct Adapter
{
    std::string address;
    std::vector<Fc_Port> fc_ports;
    std::vector<std::string> macs;
};

inline const std::vector<Adapter>& adapters()
{
    static const std::vector<Adapter> all = {
        {"20:00:02:4b:4c:a1:00:00",
         {{"10:00:02:4b:4c:a1:00:00",
           {"50:24:b4:c0:00:a1:00:01", "50:24:b4:c0:00:a2:00:01", "50:24:b4:c0:00:a2:00:02",
            "10:00:02:4b:4c:77:00:00"}},
          {"10:00:02:4b:4c:a1:00:01", {}}},
         {}},
        {"02:4b:4c:a2:00:00",
         {{"10:00:02:4b:4c:a2:00:00", {"50:24:b4:c0:00:a3:00:01"}}, {"10:00:02:4b:4c:a2:00:01", {}}},
         {"02:4b:4c:a2:00:00", "02:4b:4c:a2:00:01"}},
        {"20:00:02:4b:4c:a3:00:00", {{"10:00:02:4b:4c:a3:00:00", {"50:24:b4:c0:00:a4:00:01"}}}, {}},
    };
    return all;
}

inline const std::string adapter_list = "getAllAdaptersIndexString";

inline std::string adapter_data(const Adapter& adapter)
{
    return (adapter.macs.empty() ? "getHbaByWwn wwn=" : "getHbaByWwn mac=") + adapter.address;
}

inline void append(Calls& calls, const Calls& more)
{
    calls.insert(calls.end(), more.begin(), more.end());
}

/// The list, then what each adapter costs.
inline Calls each_adapter(const std::function<Calls(const Adapter&)>& cost)
{
    Calls calls = {adapter_list};
    for (const Adapter& adapter : adapters())
        append(calls, cost(adapter));
    return calls;
}

using Port_Cost = std::function<Calls(const Fc_Port&)>;

/// The FC ports of one adapter, and what each costs beyond its own data.
inline Calls fc_walk(const Adapter& adapter, const Port_Cost& more = {})
{
    Calls calls = {"getFcPhyPortIndicesByAdapter indexStr=" + adapter.address};
    for (const Fc_Port& port : adapter.fc_ports) {
        calls.push_back("getPortByWwn wwn=" + port.wwn);
        if (more)
            append(calls, more(port));
    }
    return calls;
}

/// All remote ports are read whole, whatever class is asked for.
inline Calls remote_port_walk(const Fc_Port& port)
{
    const std::string both = " lPortWwn=" + port.wwn + " pPortWwn=" + port.wwn;
    Calls calls = {"getAllRemotePorts" + both};
    for (const std::string& remote_port : port.remote_ports)
        calls.push_back("getCompleteRemotePort" + both + " rPortWwn=" + remote_port);
    return calls;
}

inline Calls counters(const Fc_Port& port)
{
    return {"getDynamicPortStatistics indexStr=" + port.wwn};
}
inline Calls optics(const Fc_Port& port)
{
    return {"getOpticsSFP indexStr=" + port.wwn};
}

/// The Ethernet ports of one adapter by its id: the list gives the address back.
inline Calls ethernet_walk(const Adapter& adapter, bool with_optics)
{
    Calls calls = {adapter_list, "getEthPhyPortIndicesByAdapter indexStr=" + adapter.address};
    for (const std::string& mac : adapter.macs) {
        calls.push_back("getEthPortByEthMac mac=" + mac);
        if (with_optics)
            calls.push_back("getOpticsSFP indexStr=" + mac);
    }
    return calls;
}

/// The same by a port's address. That of an FC adapter is no port's, and nothing follows.
inline Calls ethernet_walk_by_port(const Adapter& adapter)
{
    Calls calls = {"getAdapterIdByPort indexStr=" + adapter.address};
    if (!adapter.macs.empty())
        append(calls, ethernet_walk(adapter, true));
    return calls;
}

/// What an enumeration of the class costs, in order.
inline Calls cost_of(const std::string& class_name)
{
    const auto fc_ports = [](const Port_Cost& more) {
        return [more](const Adapter& adapter) { return fc_walk(adapter, more); };
    };
    const auto ethernet_ports = [](bool with_optics) {
        return [with_optics](const Adapter& adapter) {
            Calls calls = {adapter_data(adapter)};
            if (!adapter.macs.empty())
                append(calls, ethernet_walk(adapter, with_optics));
            return calls;
        };
    };
    const auto adapter_alone = [](const Adapter& adapter) { return Calls{adapter_data(adapter)}; };
    const auto with_flash = [](const Adapter& adapter) {
        return Calls{adapter_data(adapter), "getFlashInfo indexStr=" + adapter.address};
    };
    const auto connectors = [](const Adapter& adapter) {
        Calls calls = {adapter_data(adapter)};
        append(calls, fc_walk(adapter, optics));
        return calls;
    };
    static const std::map<std::string, std::function<Calls(const Adapter&)>> costs = {
        {"KALDERA_PortController", adapter_alone},
        {"KALDERA_PhysicalPackage", adapter_alone},
        {"KALDERA_Product", adapter_alone},
        {"KALDERA_AdapterSoftwareIdentity", with_flash},
        {"KALDERA_FCPort", fc_ports({})},
        {"KALDERA_SCSIProtocolEndpoint", fc_ports(remote_port_walk)},
        {"KALDERA_FCPortStatistics", fc_ports(counters)},
        {"KALDERA_LogicalPortGroup", fc_ports({})},
        {"KALDERA_AlarmDevice", fc_ports({})},
        {"KALDERA_EthernetPort", ethernet_ports(true)},
        {"KALDERA_LANEndpoint", ethernet_ports(false)},
        {"KALDERA_StorageExtent", fc_ports(remote_port_walk)},
        {"KALDERA_LogicalDisk", fc_ports(remote_port_walk)},
        {"KALDERA_TapeDrive", fc_ports(remote_port_walk)},
        {"KALDERA_PhysicalConnector", connectors},
    };
    // The host itself is known without the library.
    return class_name == "KALDERA_ComputerSystem" ? Calls{} : each_adapter(costs.at(class_name));
}

} // namespace KPRV::rich

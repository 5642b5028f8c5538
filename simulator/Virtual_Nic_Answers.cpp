// Behaviours of the functions that an Ethernet port is split into.
#include "simulator/Address.h"
#include "simulator/Behaviours.h"
#include "simulator/Lookup.h"
#include "simulator/Pci_Functions.h"
#include "simulator/Target.h"

#include <algorithm>
#include <cstdio>

namespace KPRV::simulator {

namespace {

constexpr std::size_t MOST_VNICS = 4;
constexpr unsigned LINK_BANDWIDTH = 10000;

// The port's MAC with the function in the first byte, as a locally administered address.
std::string vnic_mac(const std::string& port, unsigned function)
{
    char byte[3];
    std::snprintf(byte, sizeof byte, "%02x", (2U | function << 2) & 0xfeU);
    return byte + lower_case(port).substr(2);
}

std::vector<Virtual_Nic>::iterator find_vnic(std::vector<Virtual_Nic>& nics, const Json::Value& function)
{
    return std::find_if(nics.begin(), nics.end(), [&](const Virtual_Nic& each) {
        return function.isUInt() && each.function == function.asUInt();
    });
}

// Why the port cannot have these functions beside its own, in words; empty if it can.
std::string objection(const std::vector<Virtual_Nic>& nics)
{
    if (nics.size() > MOST_VNICS)
        return "the port has all the virtual NICs that it can have";
    unsigned long long promised = 0;
    for (const Virtual_Nic& nic : nics) {
        if (nic.min_bandwidth > nic.max_bandwidth || nic.max_bandwidth > LINK_BANDWIDTH)
            return "bandwidths must be minBandwidth <= maxBandwidth <= " + std::to_string(LINK_BANDWIDTH);
        promised += nic.min_bandwidth;
    }
    if (promised > LINK_BANDWIDTH)
        return "more bandwidth is promised than the link has";
    return "";
}

// False, and the NIC stays as it is, unless the members are bandwidths.
bool read_bandwidths(const Json::Value& written, Virtual_Nic& nic)
{
    const Json::Value& least = written["minBandwidth"];
    const Json::Value& most = written["maxBandwidth"];
    if (!has_type(least, Type::COUNT) || !has_type(most, Type::COUNT))
        return false;
    nic.min_bandwidth = least.asUInt();
    nic.max_bandwidth = most.asUInt();
    return true;
}

Json::Value bandwidths_refused()
{
    return error_answer(Error_Code::REQUEST, "minBandwidth and maxBandwidth must be unsigned integers");
}

Json::Value no_such_vnic(const Json::Value& function)
{
    return error_answer(Error_Code::NOT_FOUND, "no such virtual NIC: " + compact_text(function));
}

// Puts the functions in place unless there is something against them.
Json::Value put_vnics(Port& port, std::vector<Virtual_Nic> nics)
{
    const std::string refused = objection(nics);
    if (!refused.empty())
        return error_answer(Error_Code::CONFLICT, refused);
    port.vnics = std::move(nics);
    return done_answer();
}

Json::Value vnic_members(const Virtual_Nic& nic)
{
    Json::Value answer;
    answer["pciFunctionIndex"] = nic.function;
    answer["mac"] = nic.mac;
    answer["minBandwidth"] = nic.min_bandwidth;
    answer["maxBandwidth"] = nic.max_bandwidth;
    return answer;
}

} // namespace

Json::Value pci_function_data(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::ADAPTER, [](const Target& target) {
        Json::Value answer(Json::arrayValue);
        for (const Pci_Function& each : pci_functions(*target.adapter)) {
            Json::Value function = each.vnic ? vnic_members(*each.vnic) : Json::Value();
            function["pciFunctionIndex"] = each.index;
            function["type"] = each.type;
            function["port"] = each.physical_port;
            function["address"] = each.address;
            answer.append(function);
        }
        return answer;
    });
}

Json::Value eth_functions(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::ETH_PORT, [](const Target& target) {
        Json::Value answer(Json::arrayValue);
        Json::Value own = target.port->eth_data;
        own["mac"] = target.port->address;
        answer.append(own);
        for (const Virtual_Nic& nic : target.port->vnics)
            answer.append(vnic_members(nic));
        return answer;
    });
}

Json::Value create_vnic(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::ETH_PORT, [&](const Target& target) {
        Virtual_Nic nic{free_function(*target.adapter), "", 0, 0};
        nic.mac = vnic_mac(target.port->address, nic.function);
        if (!read_bandwidths(request, nic))
            return bandwidths_refused();
        std::vector<Virtual_Nic> nics = target.port->vnics;
        nics.push_back(nic);
        Json::Value answer = put_vnics(*target.port, nics);
        if (answer.isMember("error"))
            return answer;
        state.inventory.reset_marks.start_anew(nic.mac);
        answer["pciFunctionIndex"] = nic.function;
        return answer;
    });
}

Json::Value delete_vnics(State& state, const Json::Value& request)
{
    const Json::Value& doomed = request["pciFunctionIndices"];
    if (!doomed.isArray())
        return error_answer(Error_Code::REQUEST, "pciFunctionIndices must be an array");
    return answer_for_target(state, request, Scope::ETH_PORT, [&](const Target& target) {
        std::vector<Virtual_Nic> nics = target.port->vnics;
        for (const Json::Value& function : doomed) {
            const auto found = find_vnic(nics, function);
            if (found == nics.end())
                return no_such_vnic(function);
            nics.erase(found);
        }
        return put_vnics(*target.port, nics);
    });
}

Json::Value modify_vnics(State& state, const Json::Value& request)
{
    const Json::Value& changes = request["vNICs"];
    if (!changes.isArray())
        return error_answer(Error_Code::REQUEST, "vNICs must be an array");
    return answer_for_target(state, request, Scope::ETH_PORT, [&](const Target& target) {
        std::vector<Virtual_Nic> nics = target.port->vnics;
        for (const Json::Value& change : changes) {
            if (!change.isObject())
                return error_answer(Error_Code::REQUEST, "a virtual NIC must be an object");
            const auto found = find_vnic(nics, change["pciFunctionIndex"]);
            if (found == nics.end())
                return no_such_vnic(change["pciFunctionIndex"]);
            if (!read_bandwidths(change, *found))
                return bandwidths_refused();
        }
        return put_vnics(*target.port, nics);
    });
}

} // namespace KPRV::simulator

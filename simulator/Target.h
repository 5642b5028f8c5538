#pragma once

#include "simulator/State.h"

#include <json/json.h>
#include <string>

namespace KPRV::simulator {

/// What the first address of a request must be that of.
enum class Scope
{
    ADAPTER,
    ADAPTER_OR_PORT, // a port stands for its adapter
    PORT,            // of either kind
    FC_PORT,         // FCoE ports too
    FCOE_PORT,       // also by the MAC of the Ethernet function that shares the port
    ETH_PORT,
    VNIC,         // an Ethernet port, or a virtual NIC of one
    VIRTUAL_PORT, // an FC port; the second address is that of a virtual port of it
};

/// What the addresses of a request lead to.
struct Target
{
    Adapter* adapter = nullptr;
    Port* port = nullptr; // null for an adapter
    const Virtual_Port* virtual_port = nullptr;
    Remote_Port_List::Shared remote_port; // null if the request names none
    const Json::Value* lun = nullptr;     // its element of lunList
    const Virtual_Nic* vnic = nullptr;
    std::string path;    // the addresses in lower case, joined by slashes
    Json::Value refusal; // null if all was found; otherwise nothing else counts

    explicit operator bool() const { return refusal.isNull(); }
};

/// Follows the addresses of a request, by whichever of their names it has them: adapter or port,
/// logical port, remote port, LUN. A virtual fabric other than 0 is one that no port is in.
Target find_target(Inventory& inventory, const Json::Value& request, Scope scope);

/// As find_target for one address.
Target target_at(Inventory& inventory, const Json::Value& address, Scope scope);

/// The path of what lies behind `path`.
std::string path_below(const std::string& path, const std::string& name);

bool is_at_or_below(const std::string& path, const std::string& above);

/// Answers with what `answer` makes of the request's target, or with an "error" if it has none.
template <typename Answer>
Json::Value answer_for_target(State& state, const Json::Value& request, Scope scope, Answer answer)
{
    Target target = find_target(state.inventory, request, scope);
    return target ? answer(target) : target.refusal;
}

} // namespace KPRV::simulator

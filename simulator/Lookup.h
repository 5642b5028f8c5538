#pragma once

#include "simulator/Answers.h"
#include "simulator/Members.h"

namespace KPRV::simulator {

inline Json::Value no_such_address(const Json::Value& address)
{
    return error_answer(Error_Code::ADDRESS, "no such address: " + compact_text(address));
}

/// Answers with what `answer` makes of `place`, or with an "error" where nothing has the address.
template <typename Answer>
Json::Value answer_at(const Inventory::Place& place, const Json::Value& address, Answer answer)
{
    if (!place)
        return no_such_address(address);
    return answer(place);
}

/// Answers with what `answer` makes of the port that has this address, or with an "error" if there
/// is none.
template <typename Answer>
Json::Value answer_for_port(State& state, const Json::Value& address, Answer answer)
{
    return answer_at(state.inventory.port_at(address.asString()), address,
                     [&](const Inventory::Place& place) { return answer(*place.port); });
}

/// As answer_for_port, for what FC and FCoE ports alone have.
template <typename Answer>
Json::Value answer_for_fc_port(State& state, const Json::Value& address, Answer answer)
{
    return answer_for_port(state, address, [&](Port& port) {
        return port.kind == Port_Kind::FC ? answer(port) : no_such_address(address);
    });
}

/// The address of a request that holds it under `wwn` or `mac`; null if its form is not the one
/// that the member promises.
inline Json::Value wwn_or_mac(const Json::Value& request)
{
    const bool wwn = request.isMember("wwn");
    const Json::Value& address = request[wwn ? "wwn" : "mac"];
    return has_type(address, wwn ? Type::WWN : Type::MAC) ? address : Json::Value();
}

} // namespace KPRV::simulator

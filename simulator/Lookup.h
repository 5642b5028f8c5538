#pragma once

#include "simulator/Answers.h"
#include "simulator/Members.h"

namespace KPRV::simulator {

/// Answers with what `answer` makes of `place`, or with an "error" where nothing has the address.
template <typename Answer>
Json::Value answer_at(const Inventory::Place& place, const Json::Value& address, Answer answer)
{
    if (!place)
        return error_answer(Error_Code::ADDRESS, "no such address: " + compact_text(address));
    return answer(place);
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

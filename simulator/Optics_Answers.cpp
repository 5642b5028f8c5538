// Behaviours of what is plugged into a port: who made it, what it measures.
#include "simulator/Behaviours.h"
#include "simulator/Lookup.h"

namespace KPRV::simulator {

namespace {

// The part of what is plugged in; the slot may be empty, and an old SFP is not monitored.
Json::Value optics_part(State& state, const Json::Value& address, Json::Value Optics::*part)
{
    return answer_for_port(state, address, [&](const Port& port) {
        if (!port.optics || ((*port.optics).*part).isNull())
            return error_answer(Error_Code::EMPTY_SLOT,
                                "no such optics in the port: " + compact_text(address));
        return (*port.optics).*part;
    });
}

} // namespace

Json::Value optics_identity(State& state, const Json::Value& request)
{
    return optics_part(state, request["indexStr"], &Optics::identity);
}

Json::Value optics_readings(State& state, const Json::Value& request)
{
    return optics_part(state, request["portWwn"], &Optics::readings);
}

} // namespace KPRV::simulator

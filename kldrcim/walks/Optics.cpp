#include "kldrcim/walks/Optics.h"

#include "kldrcim/walks/Agent.h"
#include "kldrcim/walks/Rpc_Text.h"

#include <json/json.h>

namespace KPRV::kldrcim {

namespace {

/// A member in its small unit, of which `per_unit` make the base unit.
std::optional<double> reading(const Json::Value& readings, const char* member, double per_unit)
{
    const Json::Value& value = readings[member];
    return value.isNumeric() ? std::optional(value.asDouble() / per_unit) : std::nullopt;
}

} // namespace

Optics_Readings Optics_Reader::read(const std::string& port)
{
    std::string error;
    if (_is_refused)
        return {};
    const Result answer = call_agent(_connection, *rpc_request("diagnostics.getOpticsPOM", {port}, error));
    _is_refused = !answer.ok();
    Json::Value reply;
    if (_is_refused || !Json::Reader().parse(read_rpc_reply(agent_reply(answer)).result, reply) ||
        !reply.isObject())
        return {};
    const Json::Value& readings = reply;
    return {reading(readings, "temperature", 1), reading(readings, "voltage", 1e3),
            reading(readings, "biasCurrent", 1e6), reading(readings, "txPower", 1e6),
            reading(readings, "rxPower", 1e6)};
}

} // namespace KPRV::kldrcim

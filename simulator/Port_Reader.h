#pragma once

#include "simulator/Inventory.h"
#include "simulator/Port_Place.h"

namespace KPRV::simulator {

/// Builds a port from an element of "fcPorts" or "ethPorts". Takes "remotePorts" out of `written`,
/// which is otherwise left as it is. Throws Refused.
Port read_fc_port(const Json_Text& source, Json::Value& written, const Port_Place& place);
Port read_eth_port(const Json_Text& source, const Json::Value& written, const Port_Place& place);

/// Gives each of two functions that share a physical port the "optics" of the other, if its own are
/// left out. Does nothing to what are no objects.
void share_optics(Json::Value& one, Json::Value& other);

/// Throws Refused unless each member of `answers` bears the name of an entry point.
void check_answers(const Json_Text& source, const Json::Value& answers);

} // namespace KPRV::simulator

#pragma once

#include "simulator/Inventory.h"
#include "simulator/Port_Place.h"

#include <optional>

namespace KPRV::simulator {

/// Takes "optics" out of the port: what is plugged in, by default an SFP that suits the adapter.
/// Nothing for an empty slot, which is written as null. Throws Refused.
std::optional<Optics> take_optics(const Json_Text& source, Json::Value& port, const Port_Place& place);

} // namespace KPRV::simulator

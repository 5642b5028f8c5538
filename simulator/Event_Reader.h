#pragma once

#include "simulator/Event_Feed.h"
#include "simulator/Json_Text.h"

namespace KPRV::simulator {

/// Builds a script from "events": an array of objects. Throws Refused.
std::vector<Scripted_Event> read_events(const Json_Text& source, const Json::Value& written);

} // namespace KPRV::simulator

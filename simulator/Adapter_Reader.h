#pragma once

#include "simulator/Inventory.h"

namespace KPRV::simulator {

/// What the defaults of an adapter depend on: its own number from 1, and how many Ethernet ports
/// the adapters before it have.
struct Adapter_Place
{
    std::size_t number;
    std::size_t eth_ports_before;
};

/// Builds an adapter from an element of "adapters". Throws Refused.
Adapter read_adapter(const Json_Text& source, const Json::Value& written, Adapter_Place place);

/// Throws Refused unless each member of `answers` bears the name of an entry point.
void check_answers(const Json_Text& source, const Json::Value& answers);

} // namespace KPRV::simulator

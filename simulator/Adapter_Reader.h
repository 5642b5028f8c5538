#pragma once

#include "simulator/Inventory.h"

namespace KPRV::simulator {

/// What an adapter depends on.
struct Adapter_Place
{
    std::size_t number;                  // from 1
    std::size_t eth_ports_before;        // how many the adapters before have
    const Remote_Port_List& known_ports; // the host's remote ports
};

/// Builds an adapter from an element of "adapters", out of which it takes the remote ports. Throws
/// Refused.
Adapter read_adapter(const Json_Text& source, Json::Value& written, const Adapter_Place& place);

} // namespace KPRV::simulator

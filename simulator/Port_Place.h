#pragma once

#include "simulator/Remote_Port_List.h"

#include <cstddef>
#include <json/json.h>
#include <string>

namespace KPRV::simulator {

/// What the defaults of a port depend on.
struct Port_Place
{
    std::size_t adapter;                 // its number from 1
    std::size_t index;                   // among the adapter's ports of this kind, from 0
    std::size_t eth_ports_before;        // how many the adapters before have
    bool converged;                      // the adapter is a CNA
    Json::Value node_wwn;                // the adapter's, or null
    const Remote_Port_List& known_ports; // the host's remote ports
};

/// `number` in six digits or more, as in serial numbers.
inline std::string six_digits(std::size_t number)
{
    const std::string digits = std::to_string(number);
    return std::string(digits.size() < 6 ? 6 - digits.size() : 0, '0') + digits;
}

} // namespace KPRV::simulator

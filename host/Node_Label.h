#pragma once

#include "host/Topology.h"

namespace KPRV::host {

/// What people want to read of a node. Each text is one line and may be empty.
struct Node_Label
{
    /// "FC port", "target", "Kaldera CNA".
    std::string what;
    /// Name or address, addresses in colon form.
    std::string name;
    /// Model, speed, state: what is known of them.
    std::vector<std::string> facts;
};

Node_Label node_label(const Topology::Node& node);

/// A property's text on one line; empty for a null or missing one.
std::string line_of(const Instance_Value& instance, const char* property);

/// "WHAT NAME FACT, FACT".
std::string label_line(const Node_Label& label);

/// "fc_port" and its like: the kind for programs.
const char* node_kind_name(Node_Kind kind);

/// "10:00:02:4b:..." of twelve or sixteen hexadecimal digits; any other text as it is.
std::string colon_form(const std::string& address);

/// Bits per second as "8 Gb/s" or "2.5 Gb/s"; empty for 0, which stands for unknown.
std::string speed_text(std::uint64_t bits_per_second);

} // namespace KPRV::host

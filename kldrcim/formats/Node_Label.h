#pragma once

#include "kldrcim/walks/Address_Text.h"
#include "kldrcim/walks/Topology.h"

namespace KPRV::kldrcim {

/// How it is with a node, in one word and as a color.
enum class Condition
{
    /// Nothing is known, or there is nothing to know.
    NONE,
    /// It does what it is there for.
    GOOD,
    /// It does not, because somebody wants it so.
    IDLE,
    /// It may not for long.
    DOUBTFUL,
    /// It does not.
    BAD,
};

struct Node_State
{
    std::string words;
    Condition condition = Condition::NONE;
};

/// What people want to read of a node. Each text is one line and may be empty.
struct Node_Label
{
    /// "FC port", "target", "Kaldera CNA".
    std::string what;
    /// Name or address, addresses in colon form.
    std::string name;
    /// Model, speed, product: what is known of them. A state stands last.
    std::vector<std::string> facts;
    /// That of the last fact.
    Condition condition = Condition::NONE;
};

/// What is known of a node while its label is made.
struct Node_Facts
{
    Node_Kind kind;
    const Instance_Value& instance;
};

Node_Label node_label(const Node_Facts& node);

/// The properties that labels are made of.
const std::vector<std::string>& label_properties();

/// A property's text on one line; empty for a null or missing one.
std::string line_of(const Instance_Value& instance, const char* property);

/// "WHAT NAME FACT, FACT"; with the state in the color of its condition if that is wanted.
std::string label_line(const Node_Label& label, bool color = false);

/// "fc_port" and its like: the kind for programs.
const char* node_kind_name(Node_Kind kind);

/// Bits per second as "8 Gb/s" or "2.5 Gb/s"; empty for 0, which stands for unknown.
std::string speed_text(std::uint64_t bits_per_second);

} // namespace KPRV::kldrcim

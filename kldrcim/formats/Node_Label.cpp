#include "kldrcim/formats/Node_Label.h"

#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Visible_Text.h"
#include "kldrcim/walks/Property_Values.h"

#include <algorithm>
#include <cstdio>

namespace KPRV::kldrcim {

namespace {

struct State_Word
{
    const char* words;
    Condition condition;
};

using enum Condition;

// By number, as the CIM Schema has them, in the words of those who look after ports.
const State_Word enabled_states[] = {
    {"unknown", NONE},
    {"other", NONE},
    {"enabled", GOOD},
    {"disabled", IDLE},
    {"shutting down", IDLE},
    {"not applicable", NONE},
    {"enabled but offline", BAD},
    {"in test", IDLE},
    {"deferred", IDLE},
    {"quiesced", IDLE},
    {"starting", IDLE},
};

const State_Word operational_states[] = {
    {"unknown", NONE},
    {"other", NONE},
    {"OK", GOOD},
    {"degraded", DOUBTFUL},
    {"stressed", DOUBTFUL},
    {"failing soon", DOUBTFUL},
    {"error", BAD},
    {"non-recoverable error", BAD},
    {"starting", IDLE},
    {"stopping", IDLE},
    {"stopped", IDLE},
    {"in service", GOOD},
    {"no contact", BAD},
    {"link down", BAD},
    {"aborted", BAD},
    {"dormant", IDLE},
    {"supporting entity in error", BAD},
    {"completed", GOOD},
    {"power mode", IDLE},
};

/// What stops a port is a command.
constexpr std::uint64_t STOPPED = 10;

template <std::size_t Count>
Node_State state_of(const State_Word (&words)[Count], std::uint64_t number)
{
    if (number < Count)
        return {words[number].words, words[number].condition};
    return {"state " + std::to_string(number), NONE};
}

Node_State operational_state(const Instance_Value& instance)
{
    if (const auto operational = number_of(instance, "OperationalStatus"))
        return state_of(operational_states, *operational);
    const auto enabled = number_of(instance, "EnabledState");
    return enabled ? state_of(enabled_states, *enabled) : Node_State();
}

/// Of what has a link: its status says more than whether it is enabled.
Node_State link_state(const Instance_Value& instance)
{
    if (number_of(instance, "OperationalStatus") == STOPPED)
        return {"disabled", IDLE};
    return operational_state(instance);
}

/// The state stands behind the facts.
Node_Label with_state(Node_Label label, const Node_State& state)
{
    label.facts.push_back(state.words);
    label.condition = state.condition;
    return label;
}

Node_Label system_label(const Instance_Value& system)
{
    return with_state({"host", line_of(system, "Name"), {}}, operational_state(system));
}

Node_Label adapter_label(const Instance_Value& adapter)
{
    std::string kind = line_of(adapter, "Caption"), serial = line_of(adapter, "Name");
    return with_state({kind.empty() ? "adapter" : kind,
                       serial + (serial.empty() ? "" : " ") + "(" + line_of(adapter, "DeviceID") + ")",
                       {}},
                      operational_state(adapter));
}

Node_Label software_label(const Instance_Value& software)
{
    std::string version = line_of(software, "VersionString");
    switch (number_of(software, "Classifications").value_or(0)) {
    case 2:
        return {"driver", line_of(software, "InstanceID"), {version}};
    case 10:
        return {"firmware", version, {}};
    case 32770:
        return {"BIOS", version, {}};
    default:
        return {"software", line_of(software, "InstanceID"), {version}};
    }
}

Node_Label card_label(const Instance_Value& card)
{
    return {"card", line_of(card, "Model"), {line_of(card, "SerialNumber"), line_of(card, "PartNumber")}};
}

Node_Label connector_label(const Instance_Value& connector)
{
    return {"transceiver",
            line_of(connector, "Tag"),
            {line_of(connector, "Manufacturer"), line_of(connector, "PartNumber"),
             line_of(connector, "Description")}};
}

Node_Label port_label(const char* what, const std::string& device, const Instance_Value& port)
{
    return with_state({what,
                       colon_form(line_of(port, "DeviceID")),
                       {device, speed_text(number_of(port, "Speed").value_or(0))}},
                      link_state(port));
}

/// An endpoint at the far side is named for both sides of the path: near address, "_", far address.
Node_Label endpoint_label(const char* what, const Instance_Value& endpoint)
{
    std::string name = line_of(endpoint, "Name");
    return with_state({what, colon_form(name.substr(name.find('_') + 1)), {}}, link_state(endpoint));
}

/// Vendor and product stand in the unit's identifier, between the two addresses and the element name.
std::string product_of(const std::string& id, const std::string& element)
{
    std::size_t first = id.find('_');
    std::size_t second = first == std::string::npos ? first : id.find('_', first + 1);
    if (second == std::string::npos || element.empty() || !id.ends_with("_" + element) ||
        id.size() < second + element.size() + 2)
        return "";
    std::string product = id.substr(second + 1, id.size() - second - element.size() - 2);
    if (std::size_t between = product.find('_'); between != std::string::npos)
        product[between] = ' ';
    return product;
}

Node_Label unit_label(const Instance_Value& unit)
{
    std::string element = line_of(unit, "ElementName"), id = line_of(unit, "DeviceID");
    bool is_tape = same_name(unit.path.class_name, "KALDERA_TapeDrive");
    return {is_tape ? "tape" : "disk",
            element.empty() ? id : element,
            {product_of(id, element), line_of(unit, "Name")}};
}

/// "1 LUN", "64 LUNs".
Node_Label units_label(const Instance_Value& units)
{
    const std::uint64_t count = number_of(units, "Count").value_or(0);
    return {std::to_string(count) + (count == 1 ? " LUN" : " LUNs"), "", {}};
}

Node_Label label_of(const Node_Facts& node)
{
    switch (node.kind) {
    case Node_Kind::SYSTEM:
        return system_label(node.instance);
    case Node_Kind::ADAPTER:
        return adapter_label(node.instance);
    case Node_Kind::SOFTWARE:
        return software_label(node.instance);
    case Node_Kind::CARD:
        return card_label(node.instance);
    case Node_Kind::CONNECTOR:
        return connector_label(node.instance);
    case Node_Kind::FC_PORT:
        return port_label("FC port", "", node.instance);
    case Node_Kind::ETHERNET_PORT:
        return port_label("Ethernet port", line_of(node.instance, "ElementName"), node.instance);
    case Node_Kind::INITIATOR:
        return endpoint_label("initiator", node.instance);
    case Node_Kind::TARGET:
        return endpoint_label("target", node.instance);
    case Node_Kind::UNITS:
        return units_label(node.instance);
    default:
        return unit_label(node.instance);
    }
}

} // namespace

std::string line_of(const Instance_Value& instance, const char* property)
{
    const Plain_Value* value = instance.property(property);
    return value && !value->null ? visible_text(plain_text(*value)) : "";
}

const std::vector<std::string>& label_properties()
{
    static const std::vector<std::string> names = {
        "Caption",      "Classifications", "Description", "DeviceID",     "ElementName",       "EnabledState",
        "InstanceID",   "Manufacturer",    "Model",       "Name",         "OperationalStatus", "PartNumber",
        "SerialNumber", "Speed",           "Tag",         "VersionString"};
    return names;
}

Node_Label node_label(const Node_Facts& node)
{
    Node_Label label = label_of(node);
    std::erase(label.facts, "");
    return label;
}

std::string label_line(const Node_Label& label, bool color)
{
    // As terminals have them: green, grey, yellow, red.
    static constexpr const char* colors[] = {"", "\33[32m", "\33[90m", "\33[33m", "\33[1;31m"};
    std::string line = label.what + (label.name.empty() ? "" : " ") + label.name;
    for (std::size_t i = 0; i < label.facts.size(); ++i) {
        const bool is_state = i + 1 == label.facts.size() && label.condition != NONE;
        line += i ? ", " : " ";
        line += color && is_state ? colors[static_cast<int>(label.condition)] + label.facts[i] + "\33[0m"
                                  : label.facts[i];
    }
    return line;
}

const char* node_kind_name(Node_Kind kind)
{
    static const char* const names[] = {"system",    "adapter", "software",      "card",
                                        "connector", "fc_port", "ethernet_port", "initiator",
                                        "target",    "unit",    "units"};
    return names[static_cast<int>(kind)];
}

std::string speed_text(std::uint64_t bits_per_second)
{
    char text[32];
    if (bits_per_second == 0)
        return "";
    if (bits_per_second < 1000000000)
        std::snprintf(text, sizeof text, "%g Mb/s", static_cast<double>(bits_per_second) / 1e6);
    else
        std::snprintf(text, sizeof text, "%g Gb/s", static_cast<double>(bits_per_second) / 1e9);
    return text;
}

} // namespace KPRV::kldrcim

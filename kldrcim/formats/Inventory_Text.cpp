// Inventories: read back, and what is different between two of them.
#include "kldrcim/formats/Inventory_Text.h"

#include "kldrcim/formats/Counted_Text.h"
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Node_Label.h"
#include "kldrcim/formats/Visible_Text.h"

#include <json/json.h>
#include <memory>

namespace KPRV::kldrcim {

namespace {

/// Why a text is no inventory.
struct No_Inventory
{
    std::string reason;
};

Node_Kind kind_named(const std::string& name)
{
    for (int i = 0; i <= static_cast<int>(Node_Kind::UNIT); ++i)
        if (name == node_kind_name(static_cast<Node_Kind>(i)))
            return static_cast<Node_Kind>(i);
    throw No_Inventory{"no kind of object is \"" + visible_text(name) + "\""};
}

/// A member that is a text. They go to a terminal, whoever wrote the file.
std::string text_member(const Json::Value& object, const char* name)
{
    const Json::Value& value = object[name];
    if (!value.isString())
        throw No_Inventory{std::string("an object has no text \"") + name + "\""};
    return visible_text(value.asString());
}

const Json::Value& array_member(const Json::Value& object, const char* name)
{
    const Json::Value& value = object[name];
    if (!value.isNull() && !value.isArray())
        throw No_Inventory{std::string("\"") + name + "\" is no array"};
    return value;
}

Inventory_Node node_of(const Json::Value& object)
{
    if (!object.isObject())
        throw No_Inventory{"not an object of \"kldrcim tree --format json\""};
    Inventory_Node node = {kind_named(text_member(object, "kind")),
                           text_member(object, "what"),
                           text_member(object, "name"),
                           {},
                           text_member(object, "path"),
                           {}};
    for (const Json::Value& fact : array_member(object, "facts"))
        node.facts.push_back(fact.isString() ? visible_text(fact.asString()) : "");
    for (const Json::Value& child : array_member(object, "children"))
        node.children.push_back(node_of(child));
    return node;
}

/// "8 Gb/s -> 4 Gb/s".
std::string change_text(const Attribute_Change& change)
{
    const auto or_none = [](const std::string& text) { return text.empty() ? "none" : text; };
    return change.name + " " + or_none(change.before) + " -> " + or_none(change.now);
}

std::string element_text(const Inventory_Node& node)
{
    return node.what + (node.name.empty() ? "" : " ") + node.name;
}

/// What came or went is told with its facts but its state, which says little of what is gone.
std::string whole_text(const Inventory_Change& change)
{
    const Inventory_Node& node = *change.node;
    std::string text = element_text(node);
    if (node.kind == Node_Kind::UNIT)
        for (std::size_t i = 0; i < node.facts.size(); ++i)
            text += (i ? ", " : " ") + node.facts[i];
    return text;
}

std::string place_text(const Inventory_Change& change)
{
    std::string text;
    for (const Inventory_Node* node : change.above)
        text += " at " + element_text(*node);
    return text;
}

/// "with 2 targets and 6 logical units".
std::string beneath_text(const Inventory_Node& node)
{
    constexpr std::pair<Node_Kind, const char*> counted[] = {{Node_Kind::FC_PORT, "FC port"},
                                                             {Node_Kind::ETHERNET_PORT, "Ethernet port"},
                                                             {Node_Kind::TARGET, "target"},
                                                             {Node_Kind::UNIT, "logical unit"}};
    std::string text;
    for (const auto& [kind, word] : counted)
        if (const std::size_t count = count_beneath(node, kind))
            text += (text.empty() ? " with " : ", ") + counted_text(count, word);
    return text;
}

const char* change_word(Inventory_Change::Kind kind)
{
    static constexpr const char* words[] = {"came", "went", "changed"};
    return words[static_cast<int>(kind)];
}

std::string change_line(const Inventory_Change& change)
{
    const std::string word = change_word(change.kind);
    std::string line = word + std::string(9 - word.size(), ' ');
    if (change.kind != Inventory_Change::Kind::CHANGED)
        return line + whole_text(change) + place_text(change) + beneath_text(*change.node) + "\n";
    line += element_text(*change.node) + place_text(change) + ": ";
    for (std::size_t i = 0; i < change.attributes.size(); ++i)
        line += (i ? ", " : "") + change_text(change.attributes[i]);
    return line + "\n";
}

std::string change_json(const Inventory_Change& change)
{
    const Inventory_Node& node = *change.node;
    std::vector<std::string> facts, above, attributes;
    for (const std::string& fact : node.facts)
        facts.push_back(json_string(fact));
    for (const Inventory_Node* each : change.above)
        above.push_back(json_string(element_text(*each)));
    for (const Attribute_Change& each : change.attributes)
        attributes.push_back(json_object({{"name", json_string(each.name)},
                                          {"before", json_string(each.before)},
                                          {"now", json_string(each.now)}},
                                         6));
    return json_object({{"change", json_string(change_word(change.kind))},
                        {"kind", json_string(node_kind_name(node.kind))},
                        {"element", json_string(element_text(node))},
                        {"facts", json_array(facts, 4)},
                        {"at", json_array(above, 4)},
                        {"changes", json_array(attributes, 4)},
                        {"path", json_string(node.path)}},
                       2);
}

} // namespace

std::optional<Inventory_Node> read_inventory(const std::string& text, std::string& error)
{
    Json::CharReaderBuilder builder;
    builder["failIfExtra"] = true;
    const std::unique_ptr<Json::CharReader> reader(builder.newCharReader());
    try {
        Json::Value root;
        if (!reader->parse(text.data(), text.data() + text.size(), &root, nullptr))
            throw No_Inventory{"not JSON"};
        if (root.isArray() && root.size() == 1)
            root = Json::Value(root[0]);
        if (root.isArray())
            throw No_Inventory{"not the inventory of one host"};
        Inventory_Node node = node_of(root);
        if (node.kind != Node_Kind::SYSTEM)
            throw No_Inventory{"it begins with no host"};
        return node;
    } catch (const No_Inventory& why) {
        error = why.reason;
    } catch (const Json::Exception&) { // nested too deeply for the reader
        error = "not JSON";
    }
    return std::nullopt;
}

std::string diff_text(const Inventory_Diff& diff)
{
    std::string text;
    for (const Inventory_Change& change : diff.changes)
        text += change_line(change);
    return text;
}

std::string diff_json(const Inventory_Diff& diff)
{
    std::vector<std::string> elements;
    for (const Inventory_Change& change : diff.changes)
        elements.push_back(change_json(change));
    return json_array(elements) + "\n";
}

} // namespace KPRV::kldrcim

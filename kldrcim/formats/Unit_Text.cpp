#include "kldrcim/formats/Unit_Text.h"

#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Counted_Text.h"
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Node_Label.h"
#include "kldrcim/formats/Visible_Text.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

struct Mark
{
    Redundancy redundancy;
    /// For people and for programs.
    const char* words;
    const char* member;
};

constexpr Mark marks[] = {
    {Redundancy::NO_PATH, "no path", "no_path"},
    {Redundancy::ONE_PATH, "one path", "one_path"},
    {Redundancy::ONE_ADAPTER, "one adapter", "one_adapter"},
};

const Mark* mark_of(const Logical_Unit& unit)
{
    const auto at = std::ranges::find(marks, unit.redundancy(), &Mark::redundancy);
    return at == std::end(marks) ? nullptr : &*at;
}

/// How a unit looks to people: what it is and, where it is known, its product.
struct Unit_Label
{
    std::string what;
    std::string product;
    std::string identifier;
};

Unit_Label label_of(const Logical_Unit& unit)
{
    Node_Label label = node_label({Node_Kind::UNIT, unit.unit});
    // The name of the unit stands last; what is before is its product.
    const std::string name = line_of(unit.unit, "Name");
    std::erase(label.facts, name);
    return {label.what, label.facts.empty() ? "" : label.facts.front(),
            unit.identifier.empty() ? "" : visible_text(unit.identifier)};
}

std::string state_words(const Unit_Path& path)
{
    return path.in_service() ? "in service" : node_label({Node_Kind::TARGET, path.troubled}).facts.back();
}

std::string padded(const std::string& text, std::size_t width)
{
    return text + std::string(width > text.size() ? width - text.size() : 0, ' ');
}

std::string path_line(const Unit_Path& path)
{
    return "  " + padded(colon_form(path.port), 23) + "  " + padded(colon_form(path.target), 23) + "  LUN " +
           padded(visible_text(path.lun), 5) + "  " + state_words(path) + "\n";
}

std::string unit_lines(const Logical_Unit& unit)
{
    const Unit_Label label = label_of(unit);
    const Mark* const mark = mark_of(unit);
    std::string text = (label.identifier.empty() ? "without identifier" : label.identifier) + "  " +
                       label.what + (label.product.empty() ? "" : " " + label.product) +
                       (mark ? std::string("  ! ") + mark->words : "") + "\n";
    for (const Unit_Path& path : unit.paths)
        text += path_line(path);
    return text;
}

std::size_t count_of(const std::vector<Logical_Unit>& units, Redundancy redundancy)
{
    return static_cast<std::size_t>(std::ranges::count(units, redundancy, &Logical_Unit::redundancy));
}

std::size_t paths_of(const std::vector<Logical_Unit>& units)
{
    std::size_t paths = 0;
    for (const Logical_Unit& unit : units)
        paths += unit.paths.size();
    return paths;
}

std::size_t without_identifier(const std::vector<Logical_Unit>& units)
{
    return static_cast<std::size_t>(std::ranges::count(units, "", &Logical_Unit::identifier));
}

std::string path_json(const Unit_Path& path)
{
    return json_object({{"port", json_string(colon_form(path.port))},
                        {"target", json_string(colon_form(path.target))},
                        {"lun", json_string(path.lun)},
                        {"state", json_string(state_words(path))}},
                       8);
}

std::string unit_json(const Logical_Unit& unit)
{
    const Unit_Label label = label_of(unit);
    const Mark* const mark = mark_of(unit);
    std::vector<std::string> paths;
    for (const Unit_Path& path : unit.paths)
        paths.push_back(path_json(path));
    return json_object({{"identifier", unit.identifier.empty() ? "null" : json_string(unit.identifier)},
                        {"what", json_string(label.what)},
                        {"product", json_string(label.product)},
                        {"redundancy", json_string(mark ? mark->member : "full")},
                        {"path", json_string(path_text(unit.unit.path))},
                        {"paths", json_array(paths, 6)}},
                       4);
}

constexpr const char* unit_members[] = {"identifier", "what",   "product", "redundancy", "path",
                                        "port",       "target", "lun",     "state",      "paths"};

/// An address may be looked for with colons and without.
void add_address(std::vector<Plain_Value>& texts, const std::string& address)
{
    texts.push_back(Plain_Value::text(address));
    texts.push_back(Plain_Value::text(colon_form(address)));
}

} // namespace

std::span<const char* const> unit_value_names()
{
    return unit_members;
}

std::vector<Named_Value> unit_values(const Logical_Unit& unit)
{
    const Unit_Label label = label_of(unit);
    const Mark* const mark = mark_of(unit);
    const auto text = [](const std::string& each) {
        return each.empty() ? Plain_Value::null_of(CMPI_string) : Plain_Value::text(each);
    };
    std::vector<Plain_Value> ports, targets, luns, states;
    for (const Unit_Path& path : unit.paths) {
        add_address(ports, path.port);
        add_address(targets, path.target);
        luns.push_back(Plain_Value::text(path.lun));
        states.push_back(Plain_Value::text(state_words(path)));
    }
    return {{unit_members[0], text(unit.identifier)},
            {unit_members[1], text(label.what)},
            {unit_members[2], text(label.product)},
            {unit_members[3], text(mark ? mark->member : "full")},
            {unit_members[4], text(path_text(unit.unit.path))},
            {unit_members[5], Plain_Value::array(CMPI_string, ports)},
            {unit_members[6], Plain_Value::array(CMPI_string, targets)},
            {unit_members[7], Plain_Value::array(CMPI_string, luns)},
            {unit_members[8], Plain_Value::array(CMPI_string, states)},
            {unit_members[9], Plain_Value::unsigned_number(CMPI_uint32, unit.paths.size())}};
}

std::string units_json_lines(const std::vector<Logical_Unit>& units)
{
    std::string text;
    for (const Logical_Unit& unit : units)
        text += json_line(unit_json(unit));
    return text;
}

std::string units_text(const std::vector<Logical_Unit>& units)
{
    std::string text;
    for (const Logical_Unit& unit : units)
        text += unit_lines(unit);
    text += (units.empty() ? "" : "\n") + counted_text(units.size(), "logical unit") + ", " +
            counted_text(paths_of(units), "path");
    for (const Mark& mark : marks)
        text += std::string("; ") + mark.words + ": " + std::to_string(count_of(units, mark.redundancy));
    if (const std::size_t nameless = without_identifier(units))
        text += "; without identifier: " + std::to_string(nameless);
    return text + "\n";
}

std::string units_json(const std::vector<Logical_Unit>& units)
{
    std::vector<std::string> elements;
    elements.reserve(units.size());
    for (const Logical_Unit& unit : units)
        elements.push_back(unit_json(unit));
    std::vector<std::pair<std::string, std::string>> members = {{"units", json_array(elements, 2)},
                                                                {"paths", std::to_string(paths_of(units))}};
    for (const Mark& mark : marks)
        members.emplace_back(mark.member, std::to_string(count_of(units, mark.redundancy)));
    members.emplace_back("without_identifier", std::to_string(without_identifier(units)));
    return json_object(members) + "\n";
}

} // namespace KPRV::kldrcim

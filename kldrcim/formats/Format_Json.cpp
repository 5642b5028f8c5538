#include "kldrcim/formats/Format_Json.h"

#include "broker/values/Type_Words.h"
#include "broker/values/Value_Text.h"

#include <cmath>
#include <json/writer.h>

namespace KPRV::kldrcim {

namespace {

std::string between(const char* brackets, const std::vector<std::string>& lines, unsigned indent)
{
    if (lines.empty())
        return brackets;
    std::string text(1, brackets[0]);
    for (const std::string& line : lines)
        text += (text.size() > 1 ? ",\n" : "\n") + std::string(indent + 2, ' ') + line;
    return text + "\n" + std::string(indent, ' ') + brackets[1];
}

} // namespace

std::string json_string(const std::string& text)
{
    return Json::valueToQuotedString(text.c_str());
}

std::string json_line(const std::string& text)
{
    std::string line;
    bool is_indent = false;
    for (const char c : text) {
        is_indent = c == '\n' || (is_indent && c == ' ');
        if (!is_indent)
            line += c;
        else if (c == '\n' && line.ends_with(','))
            line += ' ';
    }
    return line + "\n";
}

std::string json_array(const std::vector<std::string>& elements, unsigned indent)
{
    return between("[]", elements, indent);
}

std::string json_object(const std::vector<std::pair<std::string, std::string>>& members, unsigned indent)
{
    std::vector<std::string> lines;
    lines.reserve(members.size());
    for (const auto& [name, value] : members)
        lines.push_back(json_string(name) + ": " + value);
    return between("{}", lines, indent);
}

std::string json_branch(const Json_Branch& branch, unsigned indent)
{
    std::vector<std::string> facts;
    for (const std::string& fact : branch.facts)
        facts.push_back(json_string(fact));
    std::vector<std::pair<std::string, std::string>> members = {
        {"kind", json_string(branch.kind)}, {"what", json_string(branch.what)},
        {"name", json_string(branch.name)}, {"facts", json_array(facts, indent + 2)},
        {"path", json_string(branch.path)},
    };
    if (!branch.children.empty())
        members.emplace_back("children", json_array(branch.children, indent + 2));
    return json_object(members, indent);
}

std::string json_values(const std::vector<Named_Value>& values, unsigned indent)
{
    std::vector<std::pair<std::string, std::string>> members;
    members.reserve(values.size());
    for (const Named_Value& entry : values)
        members.emplace_back(entry.name, json_text(entry.value, indent + 2));
    return json_object(members, indent);
}

std::string json_words(std::span<const Value_Meaning> meanings, const Plain_Value& value, unsigned indent)
{
    if (!value.is_array()) {
        const char* const word = word_of(meanings, value);
        return word ? json_string(word) : "null";
    }
    std::vector<std::string> elements;
    for (const Plain_Value& element : value.elements())
        elements.push_back(json_words(meanings, element, indent + 2));
    return json_array(elements, indent);
}

std::string json_instance(const Instance_Value& instance, unsigned indent, Words words)
{
    std::vector<std::pair<std::string, std::string>> members = {
        {"class", json_string(instance.path.class_name)},
        {"path", json_string(path_text(instance.path))},
        {"properties", json_values(instance.properties, indent + 2)},
    };
    const Class_Words class_words(instance.path.class_name, words);
    std::vector<std::pair<std::string, std::string>> meant;
    for (const Named_Value& property : instance.properties)
        if (const auto meanings = class_words.of(property.name); !meanings.empty() && !property.value.null)
            meant.emplace_back(property.name, json_words(meanings, property.value, indent + 4));
    if (!meant.empty())
        members.emplace_back("words", json_object(meant, indent + 2));
    return json_object(members, indent);
}

std::string json_text(const Plain_Value& value, unsigned indent)
{
    if (value.null || (is_real(value.type) && !std::isfinite(value.as_real())))
        return "null";
    if (value.is_array()) {
        std::vector<std::string> elements;
        for (const Plain_Value& element : value.elements())
            elements.push_back(json_text(element, indent + 2));
        return json_array(elements, indent);
    }
    if (value.type == CMPI_string || value.type == CMPI_dateTime)
        return json_string(value.as_text());
    if (const Path_Value* path = value.as_path())
        return json_string(path_text(*path));
    if (const Instance_Value* instance = value.as_instance())
        return json_instance(*instance, indent);
    return plain_text(value);
}

} // namespace KPRV::kldrcim

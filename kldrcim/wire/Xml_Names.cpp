#include "kldrcim/wire/Xml_Names.h"

#include <algorithm>
#include <array>
#include <bitset>
#include <unordered_map>

namespace KPRV::kldrcim {

namespace {

struct Tag_Row
{
    std::string_view name;
    std::string_view content;
    std::string_view opening;
    std::string_view closing;
};

constexpr Tag_Row tag_rows[] = {
#define X(tag, name, content) {name, content, "<" name, "</" name ">"},
    KLDR_XML_TAGS(X)
#undef X
};
constexpr std::string_view attribute_names[] = {
#define X(name) #name,
    KLDR_XML_ATTRIBUTES(X)
#undef X
};
constexpr std::string_view attribute_openings[] = {
#define X(name) (" " #name "=\""),
    KLDR_XML_ATTRIBUTES(X)
#undef X
};
constexpr std::size_t TAG_COUNT = std::size(tag_rows);

constexpr std::size_t number(Xml_Tag tag)
{
    return static_cast<std::size_t>(tag);
}

using Names = std::unordered_map<std::string_view, std::uint8_t>;

const Names& tags_by_name()
{
    static const Names names = [] {
        Names result;
        for (std::size_t i = 0; i < TAG_COUNT; ++i)
            result.emplace(tag_rows[i].name, static_cast<std::uint8_t>(i));
        return result;
    }();
    return names;
}

using Contents = std::array<std::bitset<TAG_COUNT>, TAG_COUNT>;

/// What each element may hold, by number.
Contents read_contents()
{
    Contents result;
    for (std::size_t parent = 0; parent < TAG_COUNT; ++parent) {
        std::string_view rest = tag_rows[parent].content;
        while (!rest.empty()) {
            const std::string_view word = rest.substr(0, rest.find(' '));
            rest.remove_prefix(std::min(rest.size(), word.size() + 1));
            if (const auto child = tag_of(word))
                result[parent].set(number(*child));
        }
    }
    return result;
}

} // namespace

std::string_view name_of(Xml_Tag tag)
{
    return tag_rows[number(tag)].name;
}

std::string_view name_of(Xml_Attribute attribute)
{
    return attribute_names[static_cast<std::size_t>(attribute)];
}

std::string_view opening_of(Xml_Tag tag)
{
    return tag_rows[number(tag)].opening;
}

std::string_view closing_of(Xml_Tag tag)
{
    return tag_rows[number(tag)].closing;
}

std::string_view opening_of(Xml_Attribute attribute)
{
    return attribute_openings[static_cast<std::size_t>(attribute)];
}

std::optional<Xml_Tag> tag_of(std::string_view name)
{
    const auto found = tags_by_name().find(name);
    return found == tags_by_name().end() ? std::nullopt : std::optional(static_cast<Xml_Tag>(found->second));
}

std::optional<Xml_Attribute> attribute_of(std::string_view name)
{
    const auto* const found = std::ranges::find(attribute_names, name);
    if (found == std::end(attribute_names))
        return std::nullopt;
    return static_cast<Xml_Attribute>(found - attribute_names);
}

bool may_hold(Xml_Tag parent, Xml_Tag child)
{
    static const Contents contents = read_contents();
    return contents[number(parent)].test(number(child));
}

bool holds_text(Xml_Tag tag)
{
    return tag_rows[number(tag)].content == "#";
}

} // namespace KPRV::kldrcim

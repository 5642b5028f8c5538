#include "kldrcim/wire/Qualifiers.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;
using At = Xml_Attribute;

constexpr At classes[] = {At::CLASS, At::ASSOCIATION, At::INDICATION};
constexpr At associations[] = {At::ASSOCIATION};
constexpr At indications[] = {At::CLASS, At::INDICATION};
constexpr At keys[] = {At::PROPERTY, At::REFERENCE};
constexpr At parameters[] = {At::PARAMETER};
constexpr At methods[] = {At::METHOD};
constexpr At typed[] = {At::PROPERTY, At::PARAMETER};
constexpr At valued[] = {At::PROPERTY, At::METHOD, At::PARAMETER};

// clang-format off
constexpr Qualifier_Kind kinds[] = {
//   name                array  type       overridable  to subclass  scope
    {"Abstract",         false, "boolean", true,        false,       classes},
    {"Association",      false, "boolean", false,       true,        associations},
    {"EmbeddedInstance", false, "string",  true,        true,        typed},
    {"In",               false, "boolean", false,       true,        parameters},
    {"Indication",       false, "boolean", false,       true,        indications},
    {"Key",              false, "boolean", false,       true,        keys},
    {"Out",              false, "boolean", false,       true,        parameters},
    {"Static",           false, "boolean", false,       true,        methods},
    {"ValueMap",         true,  "string",  true,        true,        valued},
    {"Values",           true,  "string",  true,        true,        valued},
};
// clang-format on

const char* word(bool flag)
{
    return flag ? "true" : "false";
}

void open_qualifier(Xml_Writer& writer, std::string_view name)
{
    const Qualifier_Kind& kind = *find_qualifier(name);
    writer.open(Tag::QUALIFIER).attribute(At::NAME, kind.name).attribute(At::TYPE, kind.type);
    if (!kind.overridable)
        writer.attribute(At::OVERRIDABLE, word(false));
    if (!kind.to_subclass)
        writer.attribute(At::TOSUBCLASS, word(false));
}

} // namespace

std::span<const Qualifier_Kind> qualifier_kinds()
{
    return kinds;
}

const Qualifier_Kind* find_qualifier(std::string_view name)
{
    const auto* found =
        std::ranges::find_if(kinds, [&](const Qualifier_Kind& kind) { return same_name(kind.name, name); });
    return found == std::end(kinds) ? nullptr : found;
}

void write_qualifier(Xml_Writer& writer, std::string_view name)
{
    write_qualifier(writer, name, "TRUE");
}

void write_qualifier(Xml_Writer& writer, std::string_view name, std::string_view text)
{
    open_qualifier(writer, name);
    write_text_value(writer, text);
    writer.close(Tag::QUALIFIER);
}

void write_qualifier(Xml_Writer& writer, std::string_view name, const std::vector<std::string>& texts)
{
    open_qualifier(writer, name);
    write_text_array(writer, texts);
    writer.close(Tag::QUALIFIER);
}

void write_declaration(Xml_Writer& writer, const Qualifier_Kind& kind)
{
    writer.open(Tag::QUALIFIER_DECLARATION)
        .attribute(At::NAME, kind.name)
        .attribute(At::TYPE, kind.type)
        .attribute(At::ISARRAY, word(kind.is_array))
        .attribute(At::OVERRIDABLE, word(kind.overridable))
        .attribute(At::TOSUBCLASS, word(kind.to_subclass));
    writer.open(Tag::SCOPE);
    for (const At each : kind.scope)
        writer.attribute(each, word(true));
    writer.empty();
    if (!kind.is_array && std::string_view(kind.type) == "boolean")
        write_text_value(writer, std::string_view(kind.name) == "In" ? "TRUE" : "FALSE");
    writer.close(Tag::QUALIFIER_DECLARATION);
}

} // namespace KPRV::kldrcim

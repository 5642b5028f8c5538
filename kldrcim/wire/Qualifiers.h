#pragma once

#include "kldrcim/wire/Instance_Writing.h"

#include <span>

namespace KPRV::kldrcim {

/// What a qualifier is by its declaration.
struct Qualifier_Kind
{
    const char* name;
    bool is_array;
    /// "boolean" or "string".
    const char* type;
    bool overridable;
    bool to_subclass;
    /// The elements of classes that may have it, as attributes of SCOPE.
    std::span<const Xml_Attribute> scope;
};

/// The qualifiers that classes are written with.
std::span<const Qualifier_Kind> qualifier_kinds();
/// Null for one that there is not; the case does not count.
const Qualifier_Kind* find_qualifier(std::string_view name);

/// QUALIFIER with the value TRUE, with a text or with a list. The name is one of the kinds.
void write_qualifier(Xml_Writer& writer, std::string_view name);
void write_qualifier(Xml_Writer& writer, std::string_view name, std::string_view text);
void write_qualifier(Xml_Writer& writer, std::string_view name, const std::vector<std::string>& texts);

/// QUALIFIER.DECLARATION.
void write_declaration(Xml_Writer& writer, const Qualifier_Kind& kind);

} // namespace KPRV::kldrcim

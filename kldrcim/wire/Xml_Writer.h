#pragma once

#include "kldrcim/wire/Xml_Names.h"

#include <string>

namespace KPRV::kldrcim {

/// Writes elements to the end of a text, which belongs to the caller and may be taken away in between. Every
/// element is closed by a tag of its own, since old readers know no other way; those without content by
/// `empty`.
///
///     writer.open(Xml_Tag::ERROR).attribute(Xml_Attribute::CODE, "6").close(Xml_Tag::ERROR);
class Xml_Writer
{
public:
    explicit Xml_Writer(std::string& out) : _out(out) {}

    Xml_Writer& open(Xml_Tag tag);
    /// Only directly behind `open`. A line break becomes a blank, as every reader would make it.
    Xml_Writer& attribute(Xml_Attribute name, std::string_view value);
    /// Characters that XML has no form for, and bytes that are no UTF-8, become U+FFFD: one such byte from
    /// an adapter must not make a whole answer unreadable.
    Xml_Writer& text(std::string_view text);
    /// What another writer has written.
    Xml_Writer& written(std::string_view elements);
    Xml_Writer& close(Xml_Tag tag);
    /// Ends the element that has just been opened, as `<TAG/>`.
    Xml_Writer& empty();

private:
    void end_tag();

    std::string& _out;
    bool _in_tag = false;
};

/// The line that every text begins with.
extern const char* const xml_declaration;

} // namespace KPRV::kldrcim

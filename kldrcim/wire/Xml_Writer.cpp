#include "kldrcim/wire/Xml_Writer.h"

#include <array>

namespace KPRV::kldrcim {

const char* const xml_declaration = "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n";

namespace {

constexpr std::string_view replacement = "\xEF\xBF\xBD";

/// True for the bytes that stand for themselves in texts and attributes.
constexpr std::array<bool, 256> plain = [] {
    std::array<bool, 256> result{};
    for (int i = 0x20; i < 0x80; ++i)
        result[i] = true;
    for (const char special : {'&', '<', '>', '"'})
        result[static_cast<unsigned char>(special)] = false;
    return result;
}();

unsigned byte_at(std::string_view text, std::size_t at)
{
    return at < text.size() ? static_cast<unsigned char>(text[at]) : 0;
}

/// How many bytes the character there has; 0 if it is broken, or none that XML knows.
std::size_t size_of_character(std::string_view text, std::size_t at)
{
    const unsigned lead = byte_at(text, at);
    const std::size_t size = lead >= 0xF0 ? 4 : lead >= 0xE0 ? 3 : lead >= 0xC0 ? 2 : 0;
    if (size == 0 || lead > 0xF4)
        return 0;
    std::uint32_t code = lead & (0xFFU >> (size + 1));
    for (std::size_t i = 1; i < size; ++i) {
        const unsigned next = byte_at(text, at + i);
        if ((next & 0xC0U) != 0x80)
            return 0;
        code = code << 6 | (next & 0x3FU);
    }
    constexpr std::uint32_t least[] = {0, 0, 0x80, 0x800, 0x10000};
    const bool surrogate = code >= 0xD800 && code <= 0xDFFF;
    return code < least[size] || code > 0x10FFFF || surrogate || code == 0xFFFE || code == 0xFFFF ? 0 : size;
}

std::string_view escape_of(char c, bool in_attribute)
{
    switch (c) {
    case '&':
        return "&amp;";
    case '<':
        return "&lt;";
    case '>':
        return "&gt;";
    case '"':
        return in_attribute ? "&quot;" : "\"";
    case '\n':
        return in_attribute ? " " : "\n";
    case '\t':
        return in_attribute ? " " : "\t";
    case '\r':
        return in_attribute ? " " : "&#13;";
    default:
        return replacement;
    }
}

void append(std::string& out, std::string_view text, bool in_attribute)
{
    std::size_t at = 0;
    while (at < text.size()) {
        std::size_t end = at;
        while (end < text.size() && plain[static_cast<unsigned char>(text[end])])
            ++end;
        out.append(text, at, end - at);
        if (end == text.size())
            return;
        if (byte_at(text, end) < 0x80) {
            out += escape_of(text[end], in_attribute);
            at = end + 1;
            continue;
        }
        const std::size_t size = size_of_character(text, end);
        out.append(size == 0 ? replacement : text.substr(end, size));
        at = end + (size == 0 ? 1 : size);
    }
}

} // namespace

void Xml_Writer::end_tag()
{
    if (_in_tag)
        _out += '>';
    _in_tag = false;
}

Xml_Writer& Xml_Writer::open(Xml_Tag tag)
{
    end_tag();
    _out += opening_of(tag);
    _in_tag = true;
    return *this;
}

Xml_Writer& Xml_Writer::attribute(Xml_Attribute name, std::string_view value)
{
    _out += opening_of(name);
    append(_out, value, true);
    _out += '"';
    return *this;
}

Xml_Writer& Xml_Writer::text(std::string_view text)
{
    end_tag();
    append(_out, text, false);
    return *this;
}

Xml_Writer& Xml_Writer::written(std::string_view elements)
{
    end_tag();
    _out += elements;
    return *this;
}

Xml_Writer& Xml_Writer::close(Xml_Tag tag)
{
    end_tag();
    _out += closing_of(tag);
    return *this;
}

Xml_Writer& Xml_Writer::empty()
{
    _out += "/>";
    _in_tag = false;
    return *this;
}

} // namespace KPRV::kldrcim

#include "kldrcim/formats/Utf8_Text.h"

#include <cstdint>
#include <string_view>

namespace KPRV::kldrcim {

namespace {

struct Lead
{
    unsigned char mask;
    unsigned char bits;
    /// Bytes of the character, and the least that may be written with so many.
    std::size_t size;
    std::uint32_t least;
};

constexpr Lead leads[] = {
    {0x80, 0x00, 1, 0},
    {0xE0, 0xC0, 2, 0x80},
    {0xF0, 0xE0, 3, 0x800},
    {0xF8, 0xF0, 4, 0x10000},
};

/// Bytes of the character at the front; 0 if there is none.
std::size_t character_size(std::string_view text)
{
    const auto byte = [&](std::size_t at) { return static_cast<unsigned char>(text[at]); };
    for (const Lead& lead : leads) {
        if ((byte(0) & lead.mask) != lead.bits || lead.size > text.size())
            continue;
        std::uint32_t character = byte(0) & static_cast<unsigned char>(~lead.mask);
        for (std::size_t i = 1; i < lead.size; ++i) {
            if ((byte(i) & 0xC0) != 0x80)
                return 0;
            character = character << 6 | (byte(i) & 0x3Fu);
        }
        const bool is_surrogate = character >= 0xD800 && character < 0xE000;
        return character >= lead.least && character <= 0x10FFFF && !is_surrogate ? lead.size : 0;
    }
    return 0;
}

} // namespace

std::string utf8_text(const std::string& text)
{
    std::string result;
    for (std::string_view rest = text; !rest.empty();) {
        const std::size_t size = character_size(rest);
        result += size ? rest.substr(0, size) : "\xEF\xBF\xBD";
        rest.remove_prefix(size ? size : 1);
    }
    return result;
}

} // namespace KPRV::kldrcim

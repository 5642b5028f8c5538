#pragma once

#include <cstddef>
#include <string_view>

namespace KPRV::broker {

/// Bytes of the control character at the front of a text in UTF-8; 0 if there stands another one. Those from
/// U+0080 on count too: terminals obey U+009B as they obey Escape and a bracket.
constexpr std::size_t control_size(std::string_view text)
{
    const auto byte = [&](std::size_t at) {
        return at < text.size() ? static_cast<unsigned char>(text[at]) : 0U;
    };
    if (text.empty())
        return 0;
    if (byte(0) < 0x20 || byte(0) == 0x7F)
        return 1;
    return byte(0) == 0xC2 && byte(1) >= 0x80 && byte(1) < 0xA0 ? 2 : 0;
}

} // namespace KPRV::broker

#pragma once

#include <algorithm>
#include <cctype>
#include <string>

namespace KPRV::simulator {

/// `text` in lower case: the form in which addresses compare.
inline std::string lower_case(std::string text)
{
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char letter) { return static_cast<char>(std::tolower(letter)); });
    return text;
}

} // namespace KPRV::simulator

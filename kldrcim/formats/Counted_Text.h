#pragma once

#include <string>

namespace KPRV::kldrcim {

/// "1 port", "2 ports".
inline std::string counted_text(std::size_t number, const char* word)
{
    return std::to_string(number) + " " + word + (number == 1 ? "" : "s");
}

} // namespace KPRV::kldrcim

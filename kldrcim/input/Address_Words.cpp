#include "kldrcim/input/Address_Words.h"

#include <algorithm>
#include <cctype>

namespace KPRV::kldrcim {

std::string address_digits(const std::string& word)
{
    std::string digits;
    for (const char c : word)
        if (c != ':' && c != '-' && c != '.')
            digits += static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return digits;
}

bool is_address(const std::string& digits)
{
    return (digits.size() == 12 || digits.size() == 16) &&
           std::ranges::all_of(digits, [](unsigned char c) { return std::isxdigit(c) != 0; });
}

} // namespace KPRV::kldrcim

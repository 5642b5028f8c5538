#pragma once

#include <stdexcept>
#include <string>

namespace KPRV {

/// A text too short to be an address. Where it is met the library has not been called yet.
class No_Address : public std::out_of_range
{
public:
    explicit No_Address(const char* text)
        : out_of_range("\"" + std::string(text) + "\" is no address: it has fewer than two characters")
    {
    }
};

} // namespace KPRV

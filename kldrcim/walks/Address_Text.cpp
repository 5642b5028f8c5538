#include "kldrcim/walks/Address_Text.h"

#include <algorithm>
#include <cctype>

namespace KPRV::kldrcim {

std::string colon_form(const std::string& address)
{
    bool is_address = (address.size() == 12 || address.size() == 16) &&
                      std::all_of(address.begin(), address.end(),
                                  [](char c) { return std::isxdigit(static_cast<unsigned char>(c)); });
    if (!is_address)
        return address;
    std::string colons;
    for (std::size_t i = 0; i < address.size(); i += 2)
        colons += (i ? ":" : "") + address.substr(i, 2);
    return colons;
}

} // namespace KPRV::kldrcim

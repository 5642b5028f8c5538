#pragma once

#include <string>

namespace KPRV::kldrcim {

/// "10:00:02:4b:..." of twelve or sixteen hexadecimal digits; any other text as it is.
std::string colon_form(const std::string& address);

} // namespace KPRV::kldrcim

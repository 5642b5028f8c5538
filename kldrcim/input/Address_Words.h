#pragma once

#include <string>

namespace KPRV::kldrcim {

/// An address as the module writes it: small letters, and without what people put between the digits.
std::string address_digits(const std::string& word);

/// True for the digits of a MAC or a world wide name.
bool is_address(const std::string& digits);

} // namespace KPRV::kldrcim

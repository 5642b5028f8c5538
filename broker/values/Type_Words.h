#pragma once

#include "contracts/cmpi/cmpidt.h"

#include <cstdint>
#include <string>

namespace KPRV::broker {

/// The scalar and object words that a value may have, without the array bit.
bool is_value_type(CMPIType type);
bool is_unsigned(CMPIType type);
bool is_signed(CMPIType type);
bool is_integer(CMPIType type);
bool is_real(CMPIType type);

/// As MOF writes it: "uint32", "string[]", "ref", "instance"; "type 17" for an unknown word.
std::string type_word_name(CMPIType type);

/// Largest number of an integer word (or char16), and smallest of a signed one.
std::uint64_t largest(CMPIType type);
std::int64_t smallest(CMPIType type);

/// "CIM_ERR_NOT_FOUND" and its like for 1 to 17, "CMPI_RC_DO_NOT_UNLOAD" and its like beyond, "CMPI_RC_OK"
/// for 0; "unknown status" for a number that has no name.
const char* status_name(int rc);
/// "CIM_ERR_NOT_FOUND (6)".
std::string code_text(int rc);
/// The number of such a name; -1 for a text that is none.
int status_of_name(const std::string& name);

} // namespace KPRV::broker

#pragma once

#include "kldrcim/wire/Wire_Error.h"

#include <string>
#include <string_view>

namespace KPRV::kldrcim {

/// "uint32", "reference" and the like, without regard to arrays; embedded instances travel as "string".
std::string wire_type_name(CMPIType type);
/// The type of such a name, whatever its case; `CMPI_null` for none. "object" and "instance" are embedded
/// instances.
CMPIType wire_type_of(std::string_view name);

/// "string", "boolean" or "numeric", as keys have it.
const char* key_kind(CMPIType type);

/// The text of a value that is neither null, nor an array, nor an object.
std::string wire_text(const Plain_Value& value);

/// The value of a text: numbers also hexadecimal, with a plus or blanks, booleans in any case. Status 13 for
/// a text that is no value of the type, or beyond its range. Not for objects.
Plain_Value value_of_wire_text(std::string_view text, CMPIType type);

} // namespace KPRV::kldrcim

#pragma once

#include <cstdint>

namespace KPRV::broker {

/// What can be handed to a provider.
enum class Object_Kind : std::uint8_t
{
    STRING,
    ARRAY,
    ENUMERATION,
    INSTANCE,
    PATH,
    ARGS,
    DATETIME,
    CONTEXT,
    RESULT,
    SELECT_EXP,
};

/// "string", "object path" and so on.
const char* kind_name(Object_Kind kind);

/// "CMPIString", "CMPIObjectPath" and so on.
const char* kind_type(Object_Kind kind);

} // namespace KPRV::broker

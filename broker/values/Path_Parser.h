#pragma once

#include "broker/values/Plain_Value.h"

#include <optional>

namespace KPRV::broker {

/// Where an object path goes wrong.
struct Path_Error
{
    /// Counted from 1; one past the end when the text stops short.
    std::size_t column = 0;
    /// What should have stood there, for example "a class name".
    std::string expected;
};

/// Reads `[namespace:]Class.Key="text",Key2=42,Key3=true`. A path without keys names a class. Texts become
/// strings (also those that hold a nested path: only the class knows), digits uint64, digits behind a minus
/// sint64. Escapes are those of MOF. On failure the result is empty and `error` is set.
std::optional<Path_Value> parse_path(std::string_view text, Path_Error& error);

} // namespace KPRV::broker

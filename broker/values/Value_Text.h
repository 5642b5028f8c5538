#pragma once

#include "broker/values/Plain_Value.h"

namespace KPRV::broker {

/// A value as people read it: a text as it is, an array as `{"a", "b"}`, "null" for null.
std::string plain_text(const Plain_Value& value);

/// A value as MOF writes it: texts quoted and escaped, "NULL" for null, references as quoted object paths.
std::string mof_text(const Plain_Value& value);

/// `instance of X { ... };` of MOF, one property a line; null properties are left out. Ends with a line
/// break.
std::string mof_instance(const Instance_Value& instance);

/// `[namespace:]Class.Key="text",Key2=42`, the form that `parse_path` reads.
std::string path_text(const Path_Value& path);

/// The text between double quotes, with the escapes of MOF.
std::string quoted(std::string_view text);

} // namespace KPRV::broker

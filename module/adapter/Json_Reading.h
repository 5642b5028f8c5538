#pragma once

#include <json/forwards.h>

#include <string>
#include <string_view>

namespace KPRV {

/// How deep arrays and objects may lie in each other. The JSON library reads by recursion, and the threads of
/// some servers have stacks of 256 KiB.
inline constexpr unsigned MOST_NESTED = 256;

/// Reads a JSON text: any value may be its root, comments are allowed, and what follows the root is ignored.
/// False if it cannot be parsed or is nested deeper than `MOST_NESTED`; `errors` then says why, for people.
/// Throws nothing but std::bad_alloc.
bool read_json(std::string_view text, Json::Value& value, std::string& errors);
/// The same, with a reader that the caller keeps: to make one costs as much as to read a short text. A reader
/// reads one text at a time, and what it has read before makes no difference.
bool read_json(Json::Reader& reader, std::string_view text, Json::Value& value, std::string& errors);

} // namespace KPRV

#pragma once

#include "simulator/Json_Text.h"

#include <cstddef>
#include <json/json.h>
#include <span>
#include <string>

namespace KPRV::simulator {

/// What a member's value must be.
enum class Type
{
    ANY,
    BOOL,
    INTEGER, // signed, 32 bits
    COUNT,   // unsigned, 32 bits
    COUNTER, // unsigned, 64 bits
    TEXT,
    WWN,     // text: eight colon-separated pairs of hexadecimal digits
    MAC,     // text: six of them
    ADDRESS, // text: either of the two
    COUNTS,  // array of COUNT
    OBJECT,
    ARRAY,
};

/// Whether a member may be left out, or be null to say "the answer has no such member".
enum class Presence
{
    REQUIRED,
    OPTIONAL,
    NULLABLE,
};

/// One member of an object that people write. `fallback` is JSON text: the value of a member that
/// is left out; a null pointer leaves it out of the answer, or leaves it to what surrounds it.
struct Member
{
    const char* name;
    Type type;
    Presence presence;
    const char* fallback = nullptr;
};

using Members = std::span<const Member>;

/// Throws Refused, with the line, unless `object` is an object that has the required ones of
/// `members`, nothing that is not among them, and the right type in each. `what` names the object.
void check_members(const Json_Text& source, const Json::Value& object, Members members,
                   const std::string& what);

/// Gives `object` a default for each member that is left out.
void fill_defaults(Json::Value& object, Members members);

/// `object` as an answer tells it: with defaults, without what is null, and with the members of
/// "extra" among its own.
Json::Value answered_members(Json::Value object, Members members);

/// As fill_defaults for one member: `value` unless the object's author named the member.
void set_default(Json::Value& object, const char* name, const Json::Value& value);

/// Takes a part out of `object`: null if its author wrote null, an empty object if nothing is written.
Json::Value take_part(Json::Value& object, const char* name);

/// Fills a member that is a text with blanks up to `length`, as the fields of a device are filled.
void pad_text(Json::Value& object, const char* name, std::size_t length);

/// True if `value` is as `type` asks. `type_words` tells in words what that is.
bool has_type(const Json::Value& value, Type type);
const char* type_words(Type type);

} // namespace KPRV::simulator

#include "simulator/Members.h"

#include "module/runtime/system/Standard_Mutex.h"

#include <algorithm>
#include <cctype>
#include <unordered_map>

namespace KPRV::simulator {

namespace {

std::string quoted(const std::string& text)
{
    return "\"" + text + "\"";
}

bool is_address(const Json::Value& value, std::size_t bytes)
{
    if (!value.isString())
        return false;
    const std::string text = value.asString();
    if (text.size() != bytes * 3 - 1)
        return false;
    for (std::size_t at = 0; at < text.size(); ++at) {
        const bool colon = at % 3 == 2;
        if (colon ? text[at] != ':' : !std::isxdigit(static_cast<unsigned char>(text[at])))
            return false;
    }
    return true;
}

bool is_counts(const Json::Value& value)
{
    return value.isArray() && std::all_of(value.begin(), value.end(),
                                          [](const Json::Value& element) { return element.isUInt(); });
}

// An integer written with a point, such as 8.0, is a number that the readers would not take.
bool is_number(const Json::Value& value)
{
    return value.type() == Json::intValue || value.type() == Json::uintValue;
}

// A large host has the same few defaults hundreds of thousands of times. The tables that hold the
// texts are constants, so a text's place names it. Never destroyed: see Simulator::instance.
const Json::Value& fallback_value(const char* text)
{
    static constinit Standard_Mutex<> mutex;
    static auto* const values PT_GUARDED_BY(mutex) = new std::unordered_map<const char*, Json::Value>;
    const Auto_Lock lock(mutex);
    const auto found = values->find(text);
    return found != values->end() ? found->second
                                  : values->emplace(text, Json_Text("default", text).parse()).first->second;
}

} // namespace

bool has_type(const Json::Value& value, Type type)
{
    switch (type) {
    case Type::ANY:
        return true;
    case Type::BOOL:
        return value.isBool();
    case Type::INTEGER:
        return is_number(value) && value.isInt();
    case Type::COUNT:
        return is_number(value) && value.isUInt();
    case Type::COUNTER:
        return is_number(value) && value.isUInt64();
    case Type::TEXT:
        return value.isString();
    case Type::WWN:
        return is_address(value, 8);
    case Type::MAC:
        return is_address(value, 6);
    case Type::ADDRESS:
        return is_address(value, 6) || is_address(value, 8);
    case Type::COUNTS:
        return is_counts(value);
    case Type::OBJECT:
        return value.type() == Json::objectValue;
    case Type::ARRAY:
        return value.type() == Json::arrayValue;
    }
    return false;
}

const char* type_words(Type type)
{
    switch (type) {
    case Type::ANY:
        return "any value";
    case Type::BOOL:
        return "true or false";
    case Type::INTEGER:
        return "an integer of 32 bits";
    case Type::COUNT:
        return "an unsigned integer of 32 bits";
    case Type::COUNTER:
        return "an unsigned integer of 64 bits";
    case Type::TEXT:
        return "a text";
    case Type::WWN:
        return "a WWN, eight colon-separated pairs of hexadecimal digits";
    case Type::MAC:
        return "a MAC, six colon-separated pairs of hexadecimal digits";
    case Type::ADDRESS:
        return "a WWN or a MAC in colon form";
    case Type::COUNTS:
        return "an array of unsigned integers";
    case Type::OBJECT:
        return "an object";
    case Type::ARRAY:
        return "an array";
    }
    return "";
}

void check_members(const Json_Text& source, const Json::Value& object, Members members,
                   const std::string& what)
{
    if (!has_type(object, Type::OBJECT))
        source.refuse(object, what + " must be an object");
    for (const std::string& name : object.getMemberNames()) {
        const Json::Value& value = object[name];
        const auto member = std::find_if(members.begin(), members.end(),
                                         [&](const Member& each) { return name == each.name; });
        if (member == members.end())
            source.refuse(value, "unknown member " + quoted(name) + " in " + what);
        const bool left_out = value.isNull() && member->presence == Presence::NULLABLE;
        if (!left_out && !has_type(value, member->type))
            source.refuse(value, quoted(name) + " in " + what + " must be " + type_words(member->type) +
                                     ", not " + compact_text(value));
    }
    for (const Member& member : members)
        if (member.presence == Presence::REQUIRED && !object.isMember(member.name))
            source.refuse(object, "missing member " + quoted(member.name) + " in " + what);
}

void fill_defaults(Json::Value& object, Members members)
{
    for (const Member& member : members)
        if (member.fallback)
            set_default(object, member.name, fallback_value(member.fallback));
}

Json::Value answered_members(Json::Value object, Members members)
{
    fill_defaults(object, members);
    const Json::Value extra = take_part(object, "extra");
    for (const std::string& name : object.getMemberNames())
        if (object[name].isNull())
            object.removeMember(name);
    for (const std::string& name : extra.getMemberNames())
        object[name] = extra[name];
    return object;
}

void set_default(Json::Value& object, const char* name, const Json::Value& value)
{
    if (!object.isMember(name))
        object[name] = value;
}

Json::Value take_part(Json::Value& object, const char* name)
{
    Json::Value taken(Json::objectValue);
    object.removeMember(name, &taken);
    return taken;
}

void pad_text(Json::Value& object, const char* name, std::size_t length)
{
    if (!object.isMember(name) || !object[name].isString())
        return;
    std::string text = object[name].asString();
    text.resize(std::max(text.size(), length), ' ');
    object[name] = text;
}

} // namespace KPRV::simulator

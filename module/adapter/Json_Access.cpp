#include "module/adapter/Json_Access.h"

#include <algorithm>
#include <cstring>
#include <limits>

namespace KPRV {

namespace {

/// Any JSON number, and what counts as one, within the limits of T.
template <class T>
T number(const Json::Value& value, const char* failure)
{
    switch (value.type()) {
    case Json::nullValue:
        return 0;
    case Json::booleanValue:
        return value.asBool() ? 1 : 0;
    case Json::intValue: {
        const Json::Int64 n = value.asInt64();
        if (n >= std::numeric_limits<T>::min() && n <= std::numeric_limits<T>::max())
            return static_cast<T>(n);
        break;
    }
    case Json::uintValue: {
        const Json::UInt64 n = value.asUInt64();
        if (n <= std::numeric_limits<T>::max())
            return static_cast<T>(n);
        break;
    }
    case Json::realValue: {
        const double n = value.asDouble();
        if (n >= std::numeric_limits<T>::min() && n <= std::numeric_limits<T>::max())
            return static_cast<T>(n);
        break;
    }
    default:
        break;
    }
    throw Not_Convertible(failure);
}

} // namespace

bool isArrayOrNull(const Json::Value& value)
{
    return value.isArray() || value.isNull();
}

bool isObjectOrNull(const Json::Value& value)
{
    return value.isObject() || value.isNull();
}

std::string_view asView(const Json::Value& value)
{
    const char* begin = nullptr;
    const char* end = nullptr;
    if (value.getString(&begin, &end))
        return {begin, size_t(end - begin)};
    // An empty one that was never given a text.
    if (value.isString())
        return "";
    if (value.isNull())
        return "";
    if (value.isBool())
        return value.asBool() ? "true" : "false";
    throw Not_Convertible("Type is not convertible to string");
}

std::string asString(const Json::Value& value)
{
    return std::string(asView(value));
}

Json::Value text_value(const Json::Value& value)
{
    return value.isString() ? value : Json::Value(asString(value));
}

int asInt(const Json::Value& value)
{
    return number<int>(value, "Type is not convertible to int");
}

unsigned asUInt(const Json::Value& value)
{
    return number<unsigned>(value, "Type is not convertible to uint");
}

bool asBool(const Json::Value& value)
{
    switch (value.type()) {
    case Json::booleanValue:
    case Json::intValue:
    case Json::uintValue:
        return value.asBool();
    case Json::realValue:
        return value.asDouble() != 0.0;
    case Json::stringValue:
        return !value.asString().empty();
    default:
        return value.isArray() || value.isObject() ? !value.empty() : false;
    }
}

namespace {

const Json::Value* find(const Json::Value& object, const char* name)
{
    return object.isObject() ? object.find(name, name + strlen(name)) : nullptr;
}

} // namespace

bool hasMember(const Json::Value& object, const char* name)
{
    return find(object, name) != nullptr;
}

const Json::Value& member(const Json::Value& object, const char* name)
{
    const Json::Value* const found = find(object, name);
    return found ? *found : Json::Value::nullSingleton();
}

void find_members(const Json::Value& object, std::span<const std::string_view> names,
                  const Json::Value** found)
{
    std::fill_n(found, names.size(), nullptr);
    if (!object.isObject())
        return;
    // An object keeps its members in the same order. Counted, since comparing iterators is a call, too.
    size_t place = 0;
    auto member = object.begin();
    for (auto count = object.size(); count > 0 && place < names.size(); --count, ++member) {
        const char* name_end = nullptr;
        const char* const name_begin = member.memberName(&name_end);
        const std::string_view name(name_begin, size_t(name_end - name_begin));
        if (names[place] != name) {
            while (place < names.size() && names[place] < name)
                place++;
            if (place == names.size() || names[place] != name)
                continue;
        }
        found[place++] = &*member;
    }
}

const Json::Value& element(const Json::Value& array, unsigned index)
{
    return array.isArray() && index < array.size() ? array[index] : Json::Value::nullSingleton();
}

} // namespace KPRV

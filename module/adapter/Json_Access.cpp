#include "module/adapter/Json_Access.h"

#include <algorithm>
#include <cstdint>
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

constexpr const char* no_text = "Type is not convertible to string";

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
    throw Not_Convertible(no_text);
}

void expectText(const Json::Value& value)
{
    const Json::ValueType type = value.type();
    if (type != Json::stringValue && type != Json::nullValue && type != Json::booleanValue)
        throw Not_Convertible(no_text);
}

std::string asString(const Json::Value& value)
{
    return std::string(asView(value));
}

void take_text(Json::Value& value, Json::Value& to)
{
    if (value.isString())
        to.swap(value);
    else
        to = asString(value);
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

const Json::Value* find_member(const Json::Value& object, const char* name)
{
    return object.isObject() ? object.find(name, name + strlen(name)) : nullptr;
}

bool hasMember(const Json::Value& object, const char* name)
{
    return find_member(object, name) != nullptr;
}

const Json::Value& member(const Json::Value& object, const char* name)
{
    const Json::Value* const found = find_member(object, name);
    return found ? *found : Json::Value::nullSingleton();
}

namespace {

/// Names are short: to compare them here takes less than a call.
[[gnu::always_inline]] inline bool is_same(std::string_view a, std::string_view b)
{
    const size_t size = a.size();
    if (size != b.size())
        return false;
    const auto same = [=]<class Part>(Part, size_t at) {
        Part x, y;
        memcpy(&x, a.data() + at, sizeof x);
        memcpy(&y, b.data() + at, sizeof y);
        return x == y;
    };
    // The last part may overlap the one before.
    constexpr size_t LONG = sizeof(uint64_t), SHORT = sizeof(uint32_t);
    // Either way (boundary): what is not compared here is compared below.
    if (size >= LONG && size <= 2 * LONG)
        return same(uint64_t(), 0) && same(uint64_t(), size - LONG);
    // Either way (boundary): as above.
    if (size >= SHORT && size < LONG)
        return same(uint32_t(), 0) && same(uint32_t(), size - SHORT);
    return a == b;
}

} // namespace

void find_members(const Json::Value& object, std::span<const std::string_view> names,
                  const Json::Value** found)
{
    std::fill_n(found, names.size(), nullptr);
    if (!object.isObject())
        return;
    // An object keeps its members in the same order: what comes before a name that was met is absent, and
    // nothing is to be compared for more than equality. Counted, since comparing iterators is a call, too.
    const std::string_view* next = names.data();
    const std::string_view* const end = next + names.size();
    auto member = object.begin();
    for (auto count = object.size(); count > 0; --count, ++member) {
        const char* name_end = nullptr;
        const char* const name_begin = member.memberName(&name_end);
        const std::string_view name(name_begin, size_t(name_end - name_begin));
        const std::string_view* met = next;
        while (met != end && !is_same(*met, name))
            ++met;
        if (met == end)
            continue;
        found[met - names.data()] = &*member;
        next = met + 1;
        if (next == end)
            return;
    }
}

const Json::Value& element(const Json::Value& array, unsigned index)
{
    return array.isArray() && index < array.size() ? array[index] : Json::Value::nullSingleton();
}

Json::Value& Element_Walk::next()
{
    // The last place is no hole: up to there is always a next element.
    if (_place < _size && _next.index() == _place++) {
        Json::Value& found = *_next;
        ++_next;
        return found;
    }
    return _hole.emplace();
}

} // namespace KPRV

#include "broker/values/Plain_Value.h"

#include "broker/values/Type_Words.h"

#include <algorithm>
#include <strings.h>

namespace KPRV::broker {

namespace {

template <class Held>
Plain_Value make(CMPIType type, Held held)
{
    Plain_Value value;
    value.type = type;
    value.null = false;
    value.data = std::move(held);
    return value;
}

template <class Held>
const Held& held_or_empty(const Plain_Value::Data& data)
{
    static const Held empty{};
    const Held* held = std::get_if<Held>(&data);
    return held ? *held : empty;
}

template <class Shared>
bool same_target(const std::shared_ptr<const Shared>& a, const std::shared_ptr<const Shared>& b)
{
    return a == b || (a && b && *a == *b);
}

bool same_key(const Plain_Value& a, const Plain_Value& b)
{
    if (is_integer(a.type) && is_integer(b.type))
        return a.as_sint() == b.as_sint();
    if (const Path_Value* path = a.as_path(); path && b.as_path())
        return same_object(*path, *b.as_path());
    return a.data == b.data;
}

} // namespace

Plain_Value Plain_Value::null_of(CMPIType type)
{
    Plain_Value value;
    value.type = type;
    return value;
}

Plain_Value Plain_Value::boolean(bool value)
{
    return make(CMPI_boolean, value);
}
Plain_Value Plain_Value::text(std::string value)
{
    return make(CMPI_string, std::move(value));
}
Plain_Value Plain_Value::datetime(std::string value)
{
    return make(CMPI_dateTime, std::move(value));
}
Plain_Value Plain_Value::unsigned_number(CMPIType type, std::uint64_t value)
{
    return make(type, value);
}
Plain_Value Plain_Value::signed_number(CMPIType type, std::int64_t value)
{
    return make(type, value);
}
Plain_Value Plain_Value::real(CMPIType type, double value)
{
    return make(type, value);
}

Plain_Value Plain_Value::path(Path_Value value)
{
    return make(CMPI_ref, std::shared_ptr<const Path_Value>(std::make_shared<Path_Value>(std::move(value))));
}

Plain_Value Plain_Value::instance(Instance_Value value)
{
    return make(CMPI_instance,
                std::shared_ptr<const Instance_Value>(std::make_shared<Instance_Value>(std::move(value))));
}

Plain_Value Plain_Value::array(CMPIType element_type, std::vector<Plain_Value> elements)
{
    return make(static_cast<CMPIType>(element_type | CMPI_ARRAY), std::move(elements));
}

bool Plain_Value::as_bool() const
{
    return held_or_empty<bool>(data);
}

std::uint64_t Plain_Value::as_uint() const
{
    if (const auto* number = std::get_if<std::uint64_t>(&data))
        return *number;
    return static_cast<std::uint64_t>(as_sint());
}

std::int64_t Plain_Value::as_sint() const
{
    if (const auto* number = std::get_if<std::uint64_t>(&data))
        return static_cast<std::int64_t>(*number);
    if (const auto* flag = std::get_if<bool>(&data))
        return *flag;
    return held_or_empty<std::int64_t>(data);
}

double Plain_Value::as_real() const
{
    return held_or_empty<double>(data);
}
const std::string& Plain_Value::as_text() const
{
    return held_or_empty<std::string>(data);
}

const Path_Value* Plain_Value::as_path() const
{
    return held_or_empty<std::shared_ptr<const Path_Value>>(data).get();
}

const Instance_Value* Plain_Value::as_instance() const
{
    return held_or_empty<std::shared_ptr<const Instance_Value>>(data).get();
}

const std::vector<Plain_Value>& Plain_Value::elements() const
{
    return held_or_empty<std::vector<Plain_Value>>(data);
}

bool operator==(const Plain_Value& a, const Plain_Value& b)
{
    if (a.type != b.type || a.null != b.null || a.data.index() != b.data.index())
        return false;
    if (const auto* path = std::get_if<std::shared_ptr<const Path_Value>>(&a.data))
        return same_target(*path, std::get<std::shared_ptr<const Path_Value>>(b.data));
    if (const auto* instance = std::get_if<std::shared_ptr<const Instance_Value>>(&a.data))
        return same_target(*instance, std::get<std::shared_ptr<const Instance_Value>>(b.data));
    return a.data == b.data;
}

bool operator==(const Named_Value& a, const Named_Value& b)
{
    return same_name(a.name, b.name) && a.value == b.value;
}

const Plain_Value* find_value(const std::vector<Named_Value>& values, std::string_view name)
{
    auto at = std::find_if(values.begin(), values.end(),
                           [&](const Named_Value& entry) { return same_name(entry.name, name); });
    return at == values.end() ? nullptr : &at->value;
}

void set_value(std::vector<Named_Value>& values, std::string_view name, Plain_Value value)
{
    if (const Plain_Value* present = find_value(values, name))
        *const_cast<Plain_Value*>(present) = std::move(value);
    else {
        // Few instances have one or two properties only.
        if (values.capacity() == 0)
            values.reserve(8);
        values.push_back({std::string(name), std::move(value)});
    }
}

bool same_object(const Path_Value& a, const Path_Value& b)
{
    return same_name(a.class_name, b.class_name) && a.keys.size() == b.keys.size() &&
           std::all_of(a.keys.begin(), a.keys.end(), [&](const Named_Value& key) {
               const Plain_Value* other = b.key(key.name);
               return other && same_key(key.value, *other);
           });
}

bool operator==(const Path_Value& a, const Path_Value& b)
{
    return a.host == b.host && a.name_space == b.name_space && same_name(a.class_name, b.class_name) &&
           a.keys == b.keys;
}

bool operator==(const Instance_Value& a, const Instance_Value& b)
{
    return a.path == b.path && a.properties == b.properties;
}

Plain_Value with_integer_type(const Plain_Value& value, CMPIType type)
{
    return is_signed(type) ? Plain_Value::signed_number(type, value.as_sint())
                           : Plain_Value::unsigned_number(type, value.as_uint());
}

bool same_name(std::string_view a, std::string_view b)
{
    return a.size() == b.size() && strncasecmp(a.data(), b.data(), a.size()) == 0;
}

std::string lower_name(std::string_view name)
{
    std::string lower(name);
    for (char& c : lower)
        if (c >= 'A' && c <= 'Z')
            c = static_cast<char>(c - 'A' + 'a');
    return lower;
}

bool contains_name(const std::vector<std::string>& list, std::string_view name)
{
    return std::any_of(list.begin(), list.end(),
                       [&](const std::string& entry) { return same_name(entry, name); });
}

} // namespace KPRV::broker

#include "broker/values/Value_Bytes.h"

#include <bit>

namespace KPRV::broker {

namespace {

/// The alternatives of a value's data.
enum Held : std::uint64_t
{
    NOTHING,
    BOOLEAN,
    UNSIGNED,
    SIGNED,
    REAL,
    TEXT,
    PATH,
    INSTANCE,
    ELEMENTS,
};
static_assert(std::variant_size_v<Plain_Value::Data> == ELEMENTS + 1);

} // namespace

/// Seven bits a byte, the lowest first.
void Byte_Writer::number(std::uint64_t number)
{
    for (; number > 0x7F; number >>= 7)
        _bytes += static_cast<char>(number | 0x80);
    _bytes += static_cast<char>(number);
}

void Byte_Writer::text(std::string_view text)
{
    number(text.size());
    _bytes += text;
}

void Byte_Writer::value(const Plain_Value& value)
{
    number(value.type);
    number(value.data.index() * 2 + value.null);
    switch (value.data.index()) {
    case BOOLEAN:
    case UNSIGNED:
    case SIGNED:
        return number(value.as_uint());
    case REAL:
        return number(std::bit_cast<std::uint64_t>(value.as_real()));
    case TEXT:
        return text(value.as_text());
    case PATH:
        return path(*value.as_path());
    case INSTANCE:
        return instance(*value.as_instance());
    case ELEMENTS:
        number(value.elements().size());
        for (const Plain_Value& element : value.elements())
            this->value(element);
        return;
    default:
        return;
    }
}

void Byte_Writer::values(const std::vector<Named_Value>& values)
{
    number(values.size());
    for (const Named_Value& each : values) {
        text(each.name);
        value(each.value);
    }
}

void Byte_Writer::path(const Path_Value& path)
{
    text(path.host);
    text(path.name_space);
    text(path.class_name);
    values(path.keys);
}

void Byte_Writer::instance(const Instance_Value& instance)
{
    path(instance.path);
    values(instance.properties);
}

std::uint64_t Byte_Reader::number()
{
    std::uint64_t number = 0;
    for (unsigned shift = 0; !_rest.empty(); shift += 7) {
        const auto byte = static_cast<unsigned char>(_rest.front());
        _rest.remove_prefix(1);
        number |= static_cast<std::uint64_t>(byte & 0x7F) << shift;
        if (byte < 0x80)
            break;
    }
    return number;
}

std::string Byte_Reader::text()
{
    const std::size_t size = number();
    std::string text(_rest.substr(0, size));
    _rest.remove_prefix(text.size());
    return text;
}

Plain_Value Byte_Reader::value()
{
    Plain_Value value;
    value.type = static_cast<CMPIType>(number());
    const std::uint64_t held = number();
    value.null = held & 1;
    switch (held / 2) {
    case BOOLEAN:
        value.data = number() != 0;
        break;
    case UNSIGNED:
        value.data = number();
        break;
    case SIGNED:
        value.data = static_cast<std::int64_t>(number());
        break;
    case REAL:
        value.data = std::bit_cast<double>(number());
        break;
    case TEXT:
        value.data = text();
        break;
    case PATH:
        value.data = std::make_shared<const Path_Value>(path());
        break;
    case INSTANCE:
        value.data = std::make_shared<const Instance_Value>(instance());
        break;
    case ELEMENTS: {
        std::vector<Plain_Value> elements(number());
        for (Plain_Value& element : elements)
            element = this->value();
        value.data = std::move(elements);
        break;
    }
    default:
        break;
    }
    return value;
}

std::vector<Named_Value> Byte_Reader::values()
{
    std::vector<Named_Value> values(number());
    for (Named_Value& each : values) {
        each.name = text();
        each.value = value();
    }
    return values;
}

Path_Value Byte_Reader::path()
{
    Path_Value path;
    path.host = text();
    path.name_space = text();
    path.class_name = text();
    path.keys = values();
    return path;
}

Instance_Value Byte_Reader::instance()
{
    Instance_Value instance;
    instance.path = path();
    instance.properties = values();
    return instance;
}

} // namespace KPRV::broker

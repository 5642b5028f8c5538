#pragma once

#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/Datetime.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/features.h"

#include <map>
#include <stdexcept>
#include <string>

namespace KPRV {

/// What is set in an instance: property name and value as text, null properties left out. Arrays are written
/// "{a, b}", texts as they are.
using Set_Properties = std::map<std::string, std::string>;

namespace instance_text {

template <class T>
std::string scalar(const T& value)
{
    return std::to_string(value);
}
template <>
inline std::string scalar(const String& value)
{
    return value.c_str();
}
template <>
inline std::string scalar(const bool& value)
{
    return value ? "true" : "false";
}

template <>
inline std::string scalar(const Datetime& value)
{
    return value.ascii().c_str();
}

template <class T>
std::string cell(const void* address, bool array)
{
    if (!array)
        return scalar(*static_cast<const T*>(address));
    std::string text, comma;
    for (const T& element : *static_cast<const Array<T>*>(address)) {
        text += comma + scalar(element);
        comma = ", ";
    }
    return "{" + text + "}";
}

inline std::string cell(uint16 type, const void* address, bool array)
{
    switch (type) {
    case BOOLEAN:
        return cell<boolean>(address, array);
    case UINT16:
        return cell<uint16>(address, array);
    case UINT32:
        return cell<uint32>(address, array);
    case SINT32:
        return cell<sint32>(address, array);
    case UINT64:
        return cell<uint64>(address, array);
    case SINT64:
        return cell<sint64>(address, array);
    case DATETIME:
        return cell<Datetime>(address, array);
    case STRING:
        return cell<String>(address, array);
    default:
        throw std::logic_error("no text for this type yet");
    }
}

} // namespace instance_text

inline Set_Properties set_properties(const Instance* instance)
{
    Set_Properties result;
    for (const Meta_Feature* feature : features_of(instance->__meta_class)) {
        if (!(feature->flags & FLAG_PROPERTY))
            continue;
        const auto* property = static_cast<const Meta_Property*>(feature);
        const char* at = reinterpret_cast<const char*>(instance) + property->offset;
        const bool array = property->subscript != 0;
        if (!at[null_offset(property)])
            result[property->name] = instance_text::cell(property->type, at, array);
    }
    return result;
}

} // namespace KPRV

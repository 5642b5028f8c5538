#pragma once

#include <cmpimacs.h>
#include <json/value.h>

#include <cstddef>
#include <span>
#include <string_view>

namespace KPRV::bench {

// What plain providers share, as such providers do.

/// First address of the host that is no loopback address, or its name.
void plain_host_name(char* buffer, size_t size);

/// The text without colons, and its size.
size_t plain_flat(char* out, size_t size, const char* address);

/// The text of a value where it stands; empty if it is none.
inline std::string_view plain_view(const Json::Value& value)
{
    const char* begin = nullptr;
    const char* end = nullptr;
    return value.isString() && value.getString(&begin, &end) ? std::string_view(begin, end)
                                                             : std::string_view();
}

/// Without the spaces at both ends.
std::string_view plain_trimmed(std::string_view text);

inline bool plain_is_bad(const Json::Value& answer)
{
    return answer.isNull() || (answer.isObject() && answer.isMember("error"));
}

inline const CMPIValue* plain_chars(const char* text)
{
    return reinterpret_cast<const CMPIValue*>(text);
}

inline void plain_set_text(CMPIInstance* instance, const char* name, const char* text)
{
    CMSetProperty(instance, name, plain_chars(text), CMPI_chars);
}

inline void plain_set_uint16(CMPIInstance* instance, const char* name, unsigned number)
{
    CMPIValue value = {};
    value.uint16 = static_cast<CMPIUint16>(number);
    CMSetProperty(instance, name, &value, CMPI_uint16);
}

inline void plain_set_uint64(CMPIInstance* instance, const char* name, CMPIUint64 number)
{
    CMPIValue value = {};
    value.uint64 = number;
    CMSetProperty(instance, name, &value, CMPI_uint64);
}

// Arrays of one element, as values to be set.

CMPIValue plain_array_of(const CMPIBroker* broker, unsigned number);
CMPIValue plain_array_of(const CMPIBroker* broker, const char* text);

/// A text key of a path; empty if there is none.
const char* plain_key(const CMPIObjectPath* path, const char* name);

/// A path with the four keys of what belongs to the host; `own_key` is the fourth.
CMPIObjectPath* plain_device_path(const CMPIBroker* broker, const char* class_name, const char* host,
                                  const char* own_key, const char* key);

/// An instance at such a path with the keys among its properties; its own is its `DeviceID`.
CMPIInstance* plain_device_instance(const CMPIBroker* broker, const char* class_name, const char* host,
                                    const char* id);

/// One end of an association.
struct plain_end
{
    const char* role;
    CMPIObjectPath* path;
};
/// An association, its ends both keys and properties.
CMPIInstance* plain_association(const CMPIBroker* broker, const char* name_space, const char* class_name,
                                std::span<const plain_end> ends);

/// The end of a `getInstance`; `found` is null if there is no such object.
CMPIStatus plain_return_found(const CMPIResult* result, const CMPIInstance* found);

/// True if the keys of a path, but for its own, are those of a device of this host.
bool plain_is_device(const CMPIObjectPath* path, const char* class_name, const char* host);

} // namespace KPRV::bench

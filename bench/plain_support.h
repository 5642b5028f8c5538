#pragma once

#include "bench/Libraries.h"

#include <cmpimacs.h>

#include <cstddef>

namespace KPRV::bench {

// What plain providers share, as such providers do.

/// First address of the host that is no loopback address, or its name.
void plain_host_name(char* buffer, size_t size);

/// The text without colons.
void plain_flat(char* out, size_t size, const char* address);

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

/// A text key of a path; empty if there is none.
const char* plain_key(const CMPIObjectPath* path, const char* name);

/// A path with the four keys of what belongs to the host; `own_key` is the fourth.
CMPIObjectPath* plain_device_path(const CMPIBroker* broker, const char* class_name, const char* host,
                                  const char* own_key, const char* key);

} // namespace KPRV::bench

#include "tests/bench/plain_support.h"

#include <arpa/inet.h>
#include <netdb.h>
#include <unistd.h>

#include <cstring>

namespace KPRV::bench {

void plain_host_name(char* buffer, size_t size)
{
    buffer[0] = '\0';
    gethostname(buffer, size);
    buffer[size - 1] = '\0';
    const hostent* const entry = gethostbyname(buffer);
    if (!entry)
        return;
    for (char** next = entry->h_addr_list; *next; next++) {
        in_addr address;
        memcpy(&address, *next, sizeof address);
        const char* const text = inet_ntoa(address);
        if (strncmp(text, "127", 3) != 0) {
            strncpy(buffer, text, size - 1);
            return;
        }
    }
}

size_t plain_flat(char* out, size_t size, const char* address)
{
    const char* const begin = out;
    char* const end = out + size - 1;
    for (; *address && out < end; address++) {
        if (*address != ':')
            *out++ = *address;
    }
    *out = '\0';
    return static_cast<size_t>(out - begin);
}

std::string_view plain_trimmed(std::string_view text)
{
    while (text.starts_with(' '))
        text.remove_prefix(1);
    while (text.ends_with(' '))
        text.remove_suffix(1);
    return text;
}

static CMPIValue array_of(const CMPIBroker* broker, const CMPIValue& element, CMPIType type)
{
    CMPIValue value = {};
    value.array = CMNewArray(broker, 1, type, nullptr);
    CMSetArrayElementAt(value.array, 0, &element, type);
    return value;
}

CMPIValue plain_array_of(const CMPIBroker* broker, unsigned number)
{
    CMPIValue element = {};
    element.uint16 = static_cast<CMPIUint16>(number);
    return array_of(broker, element, CMPI_uint16);
}

CMPIValue plain_array_of(const CMPIBroker* broker, const char* text)
{
    CMPIValue element = {};
    element.string = CMNewString(broker, text, nullptr);
    return array_of(broker, element, CMPI_string);
}

const char* plain_key(const CMPIObjectPath* path, const char* name)
{
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data = path->ft->getKey(path, name, &status);
    return status.rc == CMPI_RC_OK && data.type == CMPI_string ? CMGetCharPtr(data.value.string) : "";
}

CMPIObjectPath* plain_device_path(const CMPIBroker* broker, const char* class_name, const char* host,
                                  const char* own_key, const char* key)
{
    CMPIObjectPath* const path = CMNewObjectPath(broker, "root/kaldera", class_name, nullptr);
    CMAddKey(path, "CreationClassName", plain_chars(class_name), CMPI_chars);
    CMAddKey(path, "SystemCreationClassName", plain_chars("KALDERA_ComputerSystem"), CMPI_chars);
    CMAddKey(path, "SystemName", plain_chars(host), CMPI_chars);
    CMAddKey(path, own_key, plain_chars(key), CMPI_chars);
    return path;
}

CMPIInstance* plain_device_instance(const CMPIBroker* broker, const char* class_name, const char* host,
                                    const char* id)
{
    CMPIInstance* const instance =
        CMNewInstance(broker, plain_device_path(broker, class_name, host, "DeviceID", id), nullptr);
    plain_set_text(instance, "CreationClassName", class_name);
    plain_set_text(instance, "SystemCreationClassName", "KALDERA_ComputerSystem");
    plain_set_text(instance, "SystemName", host);
    plain_set_text(instance, "DeviceID", id);
    return instance;
}

CMPIInstance* plain_association(const CMPIBroker* broker, const char* name_space, const char* class_name,
                                std::span<const plain_end> ends)
{
    CMPIValue value = {};
    CMPIObjectPath* const path = CMNewObjectPath(broker, name_space, class_name, nullptr);
    for (const plain_end& end : ends) {
        value.ref = end.path;
        CMAddKey(path, end.role, &value, CMPI_ref);
    }
    CMPIInstance* const instance = CMNewInstance(broker, path, nullptr);
    for (const plain_end& end : ends) {
        value.ref = end.path;
        CMSetProperty(instance, end.role, &value, CMPI_ref);
    }
    return instance;
}

CMPIStatus plain_return_found(const CMPIResult* result, const CMPIInstance* found)
{
    if (!found)
        return {CMPI_RC_ERR_NOT_FOUND, nullptr};
    CMReturnInstance(result, found);
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

bool plain_is_device(const CMPIObjectPath* path, const char* class_name, const char* host)
{
    return strcmp(plain_key(path, "CreationClassName"), class_name) == 0 &&
           strcmp(plain_key(path, "SystemCreationClassName"), "KALDERA_ComputerSystem") == 0 &&
           strcmp(plain_key(path, "SystemName"), host) == 0;
}

} // namespace KPRV::bench

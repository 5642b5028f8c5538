#include "bench/plain_support.h"

#include "bench/Lean_Broker.h"

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

void plain_flat(char* out, size_t size, const char* address)
{
    char* const end = out + size - 1;
    for (; *address && out < end; address++) {
        if (*address != ':')
            *out++ = *address;
    }
    *out = '\0';
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
    CMPIObjectPath* const path = CMNewObjectPath(broker, Lean_Broker::NAME_SPACE, class_name, nullptr);
    CMAddKey(path, "CreationClassName", plain_chars(class_name), CMPI_chars);
    CMAddKey(path, "SystemCreationClassName", plain_chars("KALDERA_ComputerSystem"), CMPI_chars);
    CMAddKey(path, "SystemName", plain_chars(host), CMPI_chars);
    CMAddKey(path, own_key, plain_chars(key), CMPI_chars);
    return path;
}

} // namespace KPRV::bench

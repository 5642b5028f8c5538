#include "module/runtime/ground/Types.h"

#include "module/runtime/ground/strutil.h"

#include <cstring>

namespace KPRV {

constinit const char* const type_name[NUM_TYPES] = {
    "boolean", "uint8",  "sint8",  "uint16", "sint16", "uint32", "sint32",
    "uint64",  "sint64", "real32", "real64", "char16", "string", "datetime",
};

constinit const uint32 type_size[NUM_TYPES] = {
    1, 1, 1, 2, 2, 4, 4, 8, 8, 4, 8, 2, sizeof(void*), sizeof(void*),
};

constinit const uint32 literal_type_size[NUM_TYPES] = {
    1, 1, 1, 2, 2, 4, 4, 8, 8, 4, 8, 2, sizeof(const char*), sizeof(const char*),
};

/// Tells the fourteen names apart almost alone; the candidate is then confirmed in full.
static uint8 key_of(const char* name, size_t length)
{
    return static_cast<uint8>(__lower[static_cast<uint8>(name[0])] ^
                              __lower[static_cast<uint8>(name[length - 1])] ^ length);
}

int type_name_to_type(const char* name, Type& type)
{
    const size_t length = name ? strlen(name) : 0;
    if (length == 0)
        return -1;
    const uint8 key = key_of(name, length);
    for (uint32 i = 0; i < NUM_TYPES; i++) {
        if (key_of(type_name[i], strlen(type_name[i])) == key && name_eq(type_name[i], name)) {
            type = static_cast<Type>(i);
            return 0;
        }
    }
    return -1;
}

} // namespace KPRV

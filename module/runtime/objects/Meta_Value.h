#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

/// A default. The member in use follows from the property: by type for a scalar (`string` also for a
/// datetime, as its 25-character text), `array` for an array, whose elements are scalars or `const char*`.
union Meta_Value
{
    boolean boolean_value;
    uint8 uint8_value;
    sint8 sint8_value;
    uint16 uint16_value;
    sint16 sint16_value;
    uint32 uint32_value;
    sint32 sint32_value;
    uint64 uint64_value;
    sint64 sint64_value;
    real32 real32_value;
    real64 real64_value;
    char16 char16_value;
    const char* string_value;
    struct
    {
        const void* elements;
        uint32 num_elements;
    } array_value;
};

} // namespace KPRV

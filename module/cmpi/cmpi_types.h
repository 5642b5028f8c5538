#pragma once

#include "module/runtime/objects/Value.h"

#include <cmpidt.h>
#include <cmpift.h>
#include <cstring>

namespace KPRV {

/// CMPI type words of the scalar types, by `Type`. An array's word has `CMPI_ARRAY` added.
// clang-format off
inline constexpr CMPIType cmpi_type_words[NUM_TYPES] = {
    CMPI_boolean, CMPI_uint8,  CMPI_sint8,  CMPI_uint16, CMPI_sint16, CMPI_uint32, CMPI_sint32,
    CMPI_uint64,  CMPI_sint64, CMPI_real32, CMPI_real64, CMPI_char16, CMPI_string, CMPI_dateTime,
};
// clang-format on

/// The value type behind a type word, array bit included. NONE for a word that is not handled.
inline Value::Type value_type_of(CMPIType word)
{
    const CMPIType element = word & ~CMPI_ARRAY;
    const int array_bit = word & CMPI_ARRAY ? Value::ARRAY_BIT : 0;
    if (element == CMPI_instance || element == CMPI_ref)
        return Value::Type(Value::INSTANCE | array_bit);
    // From behind: most values are texts.
    int type = int(NUM_TYPES) - 1;
    while (type >= 0 && cmpi_type_words[type] != element)
        type--;
    return type < 0 ? Value::NONE : Value::Type(type | array_bit);
}

/// Numbers, booleans and characters lie at the start of the union as they are.
template <class T>
void store_plain(CMPIValue& to, T from)
{
    static_assert(sizeof(T) <= sizeof(CMPIValue));
    memcpy(&to, &from, sizeof(T));
}

template <class T>
T load_plain(const CMPIValue& from)
{
    T to;
    memcpy(&to, &from, sizeof(T));
    return to;
}

template <>
inline boolean load_plain<boolean>(const CMPIValue& from)
{
    return from.boolean != 0;
}

} // namespace KPRV

#pragma once

#include "module/runtime/ground/Datetime.h"
#include "module/runtime/ground/String.h"

namespace KPRV {

/// Carries a C++ type into a visitor of `visit_type`.
template <class T, Type CODE>
struct Type_Tag
{
    using type = T;
    static constexpr Type code = CODE;
};

/// Calls `visitor(Type_Tag<T, CODE>())` with the C++ type behind a CIM type code. An unknown code is answered
/// as a datetime would be, so codes are to be checked where they come in.
template <class Visitor>
decltype(auto) visit_type(Type code, Visitor&& visitor)
{
    // clang-format off
    switch (code) {
    case BOOLEAN:  return visitor(Type_Tag<boolean, BOOLEAN>());
    case UINT8:    return visitor(Type_Tag<uint8, UINT8>());
    case SINT8:    return visitor(Type_Tag<sint8, SINT8>());
    case UINT16:   return visitor(Type_Tag<uint16, UINT16>());
    case SINT16:   return visitor(Type_Tag<sint16, SINT16>());
    case UINT32:   return visitor(Type_Tag<uint32, UINT32>());
    case SINT32:   return visitor(Type_Tag<sint32, SINT32>());
    case UINT64:   return visitor(Type_Tag<uint64, UINT64>());
    case SINT64:   return visitor(Type_Tag<sint64, SINT64>());
    case REAL32:   return visitor(Type_Tag<real32, REAL32>());
    case REAL64:   return visitor(Type_Tag<real64, REAL64>());
    case CHAR16:   return visitor(Type_Tag<char16, CHAR16>());
    case STRING:   return visitor(Type_Tag<String, STRING>());
    default:       return visitor(Type_Tag<Datetime, DATETIME>());
    }
    // clang-format on
}

/// What the storage of a scalar needs when it is made, copied or released: most types are plain bytes. The
/// hot walks over an instance branch on these three, not on fourteen types.
template <class On_String, class On_Datetime, class On_Bytes>
inline decltype(auto) visit_storage(uint16 code, On_String&& on_string, On_Datetime&& on_datetime,
                                    On_Bytes&& on_bytes)
{
    if (code == STRING)
        return on_string();
    if (code == DATETIME)
        return on_datetime();
    return on_bytes();
}

/// The CIM type code of a C++ type.
template <class T>
struct Type_Code;
// clang-format off
template <> struct Type_Code<boolean>  { static constexpr Type value = BOOLEAN; };
template <> struct Type_Code<uint8>    { static constexpr Type value = UINT8; };
template <> struct Type_Code<sint8>    { static constexpr Type value = SINT8; };
template <> struct Type_Code<uint16>   { static constexpr Type value = UINT16; };
template <> struct Type_Code<sint16>   { static constexpr Type value = SINT16; };
template <> struct Type_Code<uint32>   { static constexpr Type value = UINT32; };
template <> struct Type_Code<sint32>   { static constexpr Type value = SINT32; };
template <> struct Type_Code<uint64>   { static constexpr Type value = UINT64; };
template <> struct Type_Code<sint64>   { static constexpr Type value = SINT64; };
template <> struct Type_Code<real32>   { static constexpr Type value = REAL32; };
template <> struct Type_Code<real64>   { static constexpr Type value = REAL64; };
template <> struct Type_Code<char16>   { static constexpr Type value = CHAR16; };
template <> struct Type_Code<String>   { static constexpr Type value = STRING; };
template <> struct Type_Code<Datetime> { static constexpr Type value = DATETIME; };
// clang-format on

} // namespace KPRV

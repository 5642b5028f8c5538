#pragma once

#include "module/runtime/ground/Types.h"

#include <new>

namespace KPRV {

/// How type-erased array code handles one element. A null function means plain bytes.
struct __Array_Traits
{
    uint32 size;
    void (*construct)(void* element, const void* from);
    void (*destruct)(void* element);
    bool (*equal)(const void* a, const void* b);
};

/// Traits of the CIM scalar types, by `Type`.
extern const __Array_Traits* const __cim_array_traits[NUM_TYPES];

/// Traits of all pointers, which are copied and compared as bytes.
extern const __Array_Traits* const __pointer_array_traits;

/// Traits of any other class: copy construction, destruction, `operator==`.
template <class T>
struct __Array_Traits_Factory
{
    /// Whether arrays without elements share a block, so that none is allocated.
    static constexpr bool SHARES_EMPTY = false;

    static void construct(void* element, const void* from) { new (element) T(*static_cast<const T*>(from)); }
    static void destruct(void* element) { static_cast<T*>(element)->~T(); }
    static bool equal(const void* a, const void* b)
    {
        return *static_cast<const T*>(a) == *static_cast<const T*>(b);
    }
    static constexpr __Array_Traits record = {sizeof(T), construct, destruct, equal};
    static const __Array_Traits* traits() { return &record; }
};

template <class T>
struct __Array_Traits_Factory_Raw;
template <>
struct __Array_Traits_Factory_Raw<void*>
{
    static constexpr bool SHARES_EMPTY = true;
    static const __Array_Traits* traits() { return __pointer_array_traits; }
};

template <class T>
struct __Array_Traits_Factory<T*> : __Array_Traits_Factory_Raw<void*>
{
};

class String;
class Datetime;

template <Type CODE>
struct __Array_Traits_Of_Type
{
    static constexpr bool SHARES_EMPTY = true;
    static const __Array_Traits* traits() { return __cim_array_traits[CODE]; }
};

// clang-format off
template <> struct __Array_Traits_Factory<boolean>  : __Array_Traits_Of_Type<BOOLEAN>  {};
template <> struct __Array_Traits_Factory<uint8>    : __Array_Traits_Of_Type<UINT8>    {};
template <> struct __Array_Traits_Factory<sint8>    : __Array_Traits_Of_Type<SINT8>    {};
template <> struct __Array_Traits_Factory<uint16>   : __Array_Traits_Of_Type<UINT16>   {};
template <> struct __Array_Traits_Factory<sint16>   : __Array_Traits_Of_Type<SINT16>   {};
template <> struct __Array_Traits_Factory<uint32>   : __Array_Traits_Of_Type<UINT32>   {};
template <> struct __Array_Traits_Factory<sint32>   : __Array_Traits_Of_Type<SINT32>   {};
template <> struct __Array_Traits_Factory<uint64>   : __Array_Traits_Of_Type<UINT64>   {};
template <> struct __Array_Traits_Factory<sint64>   : __Array_Traits_Of_Type<SINT64>   {};
template <> struct __Array_Traits_Factory<real32>   : __Array_Traits_Of_Type<REAL32>   {};
template <> struct __Array_Traits_Factory<real64>   : __Array_Traits_Of_Type<REAL64>   {};
template <> struct __Array_Traits_Factory<char16>   : __Array_Traits_Of_Type<CHAR16>   {};
template <> struct __Array_Traits_Factory<String>   : __Array_Traits_Of_Type<STRING>   {};
template <> struct __Array_Traits_Factory<Datetime> : __Array_Traits_Of_Type<DATETIME> {};
// clang-format on

} // namespace KPRV

#pragma once

#include "module/runtime/ground/Array.h"

#include <cstdint>

namespace KPRV {

// Most arrays of an instance never hold an element. Those of CIM types and of pointers then share constant
// blocks, so that making, cloning, moving and releasing one allocates nothing. Nothing may be written to one:
// what would write to an array takes a block of its own first.

/// Capacity of an array that never held an element.
inline constexpr uint32 FIRST_CAPACITY = 8;

/// Elements that are handled differently: nine of CIM types, and pointers.
inline constexpr size_t ELEMENT_KINDS = 10;

struct Empty_Block
{
    __Array_Rep head;
    /// So that the place of the elements still lies within it.
    char rest[__ARRAY_HEAD - sizeof(__Array_Rep) + 8];
};

/// Traits of such elements, and their arrays of none: a fresh one and a clone of one.
struct Empty_Arrays
{
    __Array_Traits traits;
    Empty_Block fresh;
    Empty_Block none;
};
extern const Empty_Arrays empty_arrays[ELEMENT_KINDS];

/// True if the address lies within those.
inline bool is_of_empty_arrays(const void* address)
{
    return reinterpret_cast<uintptr_t>(address) - reinterpret_cast<uintptr_t>(empty_arrays) <
           sizeof(empty_arrays);
}

/// The shared block of that capacity or of 0 for such arrays; null for other traits or another capacity.
__Array_Rep* empty_array_of(const __Array_Traits* traits, uint32 capacity);

/// What a fresh array of such elements holds.
inline __Array_Rep* fresh_array_of(const __Array_Traits* traits)
{
    return const_cast<__Array_Rep*>(&reinterpret_cast<const Empty_Arrays*>(traits)->fresh.head);
}
inline __Array_Rep* fresh_array_of(Type type)
{
    return fresh_array_of(__cim_array_traits[type]);
}

inline bool is_empty_array(const __Array_Rep* rep)
{
    return is_of_empty_arrays(rep);
}

} // namespace KPRV

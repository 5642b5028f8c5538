#pragma once

#include "runtime/Array.h"

namespace KPRV {

// Most arrays of an instance never hold an element. Those of CIM types then share constant blocks, so that
// making, cloning and releasing such a cell allocates nothing. Nothing may be written to one: what would
// write to an array takes a block of its own first.

/// Capacity of an array that never held an element.
inline constexpr uint32 FIRST_CAPACITY = 8;

/// The shared block of that capacity or of 0 for arrays of a CIM type; null for other traits or another
/// capacity.
__Array_Rep* empty_array_of(const __Array_Traits* traits, uint32 capacity);

bool is_empty_array(const __Array_Rep* rep);

} // namespace KPRV

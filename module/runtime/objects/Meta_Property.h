#pragma once

#include "module/runtime/objects/Meta_Feature.h"

namespace KPRV {

struct Meta_Property : Meta_Feature
{
    /// `Type` code.
    uint16 type;
    /// 0 scalar, -1 array of variable size, positive array of that size.
    sint16 subscript;
    /// Byte offset of the `Property` cell in the instance.
    uint32 offset;
    /// Default value, null if none.
    const Meta_Value* value;
};

/// Compares two `Property` cells: null states first, then values, also when both are null. A NaN equals
/// nothing.
bool property_eq(const Meta_Property* mp, const void* a, const void* b);

} // namespace KPRV

#pragma once

#include "module/runtime/objects/Meta_Feature.h"

namespace KPRV {

struct Meta_Class;

struct Meta_Reference : Meta_Feature
{
    /// 0 scalar, otherwise an array of references.
    sint16 subscript;
    /// The class that the reference points to.
    const Meta_Class* meta_class;
    /// Byte offset of the pointer (or array cell) in the instance.
    uint32 offset;
};

} // namespace KPRV

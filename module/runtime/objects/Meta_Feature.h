#pragma once

#include "module/runtime/objects/Meta_Qualifier.h"
#include "module/runtime/text/flags.h"

namespace KPRV {

/// Head of every qualified record. A count of 0 marks a static table, which is never counted or freed.
struct Meta_Qualified_Object
{
    sint32 refs;
    uint32 flags;
    const char* name;
    const Meta_Qualifier* const* meta_qualifiers;
    uint32 num_meta_qualifiers;
};

/// A property, reference, method or parameter: bits 0 to 2 of the flags say which.
struct Meta_Feature : Meta_Qualified_Object
{
};

} // namespace KPRV

#pragma once

#include "module/runtime/objects/Meta_Value.h"

namespace KPRV {

/// A qualifier with a value. The generated tables hold none (boolean ones survive as flags); copies may.
struct Meta_Qualifier
{
    uint32 refs;
    const char* name;
    uint8 type;
    uint8 subscript;
    const Meta_Value* value;
};

/// A qualifier of the list by name, whatever its case; null if there is none.
const Meta_Qualifier* find(const Meta_Qualifier* const* qualifiers, size_t count, const char* name);

} // namespace KPRV

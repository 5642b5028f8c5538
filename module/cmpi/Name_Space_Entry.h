#pragma once

#include "module/runtime/ground/String.h"

namespace KPRV {

/// A name space with the number of active indication filters in it. Equality is by name, case included; the
/// count takes no part.
struct Name_Space_Entry
{
    String name_space;
    uint32 count;
};

inline bool operator==(const Name_Space_Entry& a, const Name_Space_Entry& b)
{
    return a.name_space == b.name_space;
}

} // namespace KPRV

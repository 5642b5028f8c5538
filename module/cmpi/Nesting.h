#pragma once

#include "module/runtime/objects/Meta_Class.h"

namespace KPRV {

/// References and embedded instances may lie in each other so deep; an object of a request itself is no
/// level. No client comes near it, and without a bound a hostile one ends a server whose threads have small
/// stacks.
inline constexpr unsigned MOST_NESTED_REFERENCES = 64;

/// Where in an object of the server a reference or an embedded instance is met.
struct Nesting
{
    /// How many others it lies in.
    unsigned depth = 0;
    /// What it must be of to be kept, if that is known.
    const Meta_Class* wanted = nullptr;
};

/// False, with a line in the log, for what lies too deep to be converted.
bool may_descend(unsigned depth);

} // namespace KPRV

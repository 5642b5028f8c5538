#pragma once

#include "module/runtime/objects/Meta_Class.h"

namespace KPRV {

/// True if two classes describe the same instances: flags, name, features in order with their types and
/// places, size, what is local, and keys. Names are compared without case. Default values, qualifiers and the
/// target's rank (scalar or array) of a reference do not count, and a super class counts only where both have
/// one. Two nulls are the same.
bool identical(const Meta_Class* a, const Meta_Class* b);

} // namespace KPRV

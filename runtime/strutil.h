#pragma once

#include "runtime/Types.h"

namespace KPRV {

/// Bounded copy, always terminated when size is not 0. Returns the length of the full source.
size_t strlcpy(char* dest, const char* src, size_t size);

/// Bounded concatenation; returns the length that the full text would have had.
size_t strlcat(char* dest, const char* src, size_t size);

/// Folds "A" to "Z" and leaves every other byte: case folding of CIM names.
extern const uint8 __lower[256];

/// Case-insensitive equality of CIM names. The first characters are compared before a call is paid for.
bool name_eq(const char* a, const char* b);

} // namespace KPRV

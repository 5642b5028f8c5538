#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

/// Bounded copy, always terminated when size is not 0. Returns the length of the full source.
size_t strlcpy(char* dest, const char* src, size_t size);

/// Bounded concatenation; returns the length that the full text would have had.
size_t strlcat(char* dest, const char* src, size_t size);

/// Folds "A" to "Z" and leaves every other byte: case folding of CIM names.
extern const uint8 __lower[256];

/// Equality of the first n bytes, or up to a zero byte in both, with `__lower` folded. It does not ask the
/// locale, which belongs to the server: under some of them "I" and "i" are different letters.
bool folded_eq(const char* a, const char* b, size_t n);

/// For `name_eq`, which has compared what stands before.
bool name_rest_eq(const char* a, const char* b);

/// Case-insensitive equality of CIM names. Before a call is paid for, as many characters are compared as tell
/// most names of one schema apart, its prefix and the one behind it.
inline bool name_eq(const char* a, const char* b)
{
    // Names of one binary are mostly the very same literal.
    if (a == b)
        return true;
    for (int i = 0; i < 9; i++, a++, b++) {
        if (__lower[static_cast<uint8>(*a)] != __lower[static_cast<uint8>(*b)])
            return false;
        if (*a == '\0')
            return true;
    }
    return name_rest_eq(a, b);
}

} // namespace KPRV

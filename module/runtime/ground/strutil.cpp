#include "module/runtime/ground/strutil.h"

#include <algorithm>
#include <array>
#include <cstring>

namespace KPRV {

size_t strlcpy(char* dest, const char* src, size_t size)
{
    const size_t length = strlen(src);
    if (size != 0) {
        const size_t n = std::min(length, size - 1);
        memcpy(dest, src, n);
        dest[n] = '\0';
    }
    return length;
}

size_t strlcat(char* dest, const char* src, size_t size)
{
    const size_t used = strnlen(dest, size);
    // A destination without a terminator is full: it is left as it is.
    return used + (used < size ? strlcpy(dest + used, src, size - used) : strlen(src));
}

// clang-format off
#define ROW(C) C, C + 1, C + 2, C + 3, C + 4, C + 5, C + 6, C + 7
constinit const uint8 __lower[256] = {
    ROW(0x00), ROW(0x08), ROW(0x10), ROW(0x18), ROW(0x20), ROW(0x28), ROW(0x30), ROW(0x38),
    '@', 'a', 'b', 'c', 'd', 'e', 'f', 'g', ROW('h'), ROW('p'), 'x', 'y', 'z', '[', '\\', ']', '^', '_',
    ROW(0x60), ROW(0x68), ROW(0x70), ROW(0x78), ROW(0x80), ROW(0x88), ROW(0x90), ROW(0x98),
    ROW(0xA0), ROW(0xA8), ROW(0xB0), ROW(0xB8), ROW(0xC0), ROW(0xC8), ROW(0xD0), ROW(0xD8),
    ROW(0xE0), ROW(0xE8), ROW(0xF0), ROW(0xF8),
};
#undef ROW
// clang-format on

bool name_rest_eq(const char* a, const char* b)
{
    // Mostly they are spelled alike, and the C library finds that out many letters at a time.
    return strcmp(a, b) == 0 || folded_eq(a, b, ~size_t(0));
}

bool folded_eq(const char* a, const char* b, size_t n)
{
    for (size_t i = 0; i < n; i++) {
        if (__lower[static_cast<uint8>(a[i])] != __lower[static_cast<uint8>(b[i])])
            return false;
        if (a[i] == '\0')
            break;
    }
    return true;
}

} // namespace KPRV

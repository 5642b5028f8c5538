#pragma once

#include "module/runtime/ground/Types.h"

#include <cstdarg>

namespace KPRV {

/// Growable byte buffer that owns one block, with a spare byte above `cap` for a terminator. Copies are deep.
class Buffer
{
public:
    Buffer() = default;
    Buffer(const Buffer& x);
    Buffer& operator=(const Buffer& x);
    ~Buffer();

    /// The bytes, terminated by a zero byte; an empty text when nothing was ever stored.
    const char* data() const;
    uint32 size() const { return _size; }
    uint32 capacity() const { return _cap; }

    /// Grows only: to at least 4096, with exact size beyond that.
    void reserve(uint32 n);
    void insert(uint32 pos, const char* data, size_t n);
    void append(const char* data, size_t n);
    void append(const char* text);
    void append(char c);
    void remove(uint32 pos, uint32 n);
    void clear() { _size = 0; }

    /// Append as `printf` would; the number of characters appended.
    uint32 format(const char* format, ...) __attribute__((format(printf, 2, 3)));
    uint32 vformat(const char* format, va_list arguments) __attribute__((format(printf, 2, 0)));

    void append_uint16(uint16 x);
    void append_uint32(uint32 x);
    void append_uint64(uint64 x);

    /// Hexadecimal listing on standard output, 16 bytes a line, for debugging.
    void dump() const;

private:
    void _reserve_aux(uint32 n);
    void _append_aux();

    char* _data = nullptr;
    uint32 _size = 0;
    uint32 _cap = 0;
};

/// Capacity rule of a buffer: 4096 below 4096, otherwise the next power of 2.
uint32 _round_up_pow_2(uint32 n);

} // namespace KPRV

#include "module/runtime/text/Buffer.h"

#include "module/runtime/ground/allocated.h"
#include "module/runtime/text/number_text.h"

#include <algorithm>
#include <bit>
#include <cctype>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace KPRV {

static constexpr uint32 LEAST_CAPACITY = 4096;

uint32 _round_up_pow_2(uint32 n)
{
    // Above the last power of 2 there is no larger one.
    return n < LEAST_CAPACITY ? LEAST_CAPACITY : n > 0x80000000u ? n : std::bit_ceil(n);
}

Buffer::Buffer(const Buffer& x)
{
    append(x._data, x._size);
}

Buffer& Buffer::operator=(const Buffer& x)
{
    if (this != &x) {
        clear();
        append(x._data, x._size);
    }
    return *this;
}

Buffer::~Buffer()
{
    free(_data);
}

const char* Buffer::data() const
{
    if (!_data)
        return "";
    _data[_size] = '\0';
    return _data;
}

/// A size as a buffer holds it. Beyond, `std::bad_alloc`, as for every size for which there is no memory.
static uint32 buffer_size(uint64 n)
{
    // The terminator must have its place too.
    if (n >= NPOS)
        throw std::bad_alloc();
    return static_cast<uint32>(n);
}

void Buffer::reserve(uint32 n)
{
    n = std::max(n, LEAST_CAPACITY);
    if (n <= _cap)
        return;
    _data = static_cast<char*>(allocated(realloc(_data, size_t(n) + 1)));
    _cap = n;
}

void Buffer::_reserve_aux(uint32 n)
{
    reserve(_round_up_pow_2(n));
}

void Buffer::_append_aux()
{
    reserve(_cap == 0 ? LEAST_CAPACITY : buffer_size(2 * uint64(_cap)));
}

void Buffer::insert(uint32 pos, const char* data, size_t n)
{
    if (n == 0)
        return;
    pos = std::min(pos, _size);
    const uint32 size = buffer_size(uint64(_size) + n);
    if (size > _cap)
        _reserve_aux(size);
    memmove(_data + pos + n, _data + pos, _size - pos);
    memcpy(_data + pos, data, n);
    _size = size;
}

void Buffer::append(const char* data, size_t n)
{
    insert(_size, data, n);
}

void Buffer::append(const char* text)
{
    append(text, strlen(text));
}

void Buffer::append(char c)
{
    if (_size == _cap)
        _append_aux();
    _data[_size++] = c;
}

void Buffer::remove(uint32 pos, uint32 n)
{
    if (pos >= _size)
        return;
    n = std::min(n, _size - pos);
    memmove(_data + pos, _data + pos + n, _size - pos - n);
    _size -= n;
}

uint32 Buffer::format(const char* format, ...)
{
    va_list arguments;
    va_start(arguments, format);
    const uint32 n = vformat(format, arguments);
    va_end(arguments);
    return n;
}

uint32 Buffer::vformat(const char* format, va_list arguments)
{
    // A negative answer once meant "too small" and now means a text that cannot be converted: the doubling
    // ends somewhere.
    constexpr uint32 GIVE_UP = 1u << 20;
    for (uint32 room = 128;;) {
        _reserve_aux(buffer_size(uint64(_size) + room));
        va_list copy;
        va_copy(copy, arguments);
        const int n = vsnprintf(_data + _size, room, format, copy);
        va_end(copy);
        if (n < 0) {
            // Either way (boundary): one doubling more in vain shows nowhere.
            if (room >= GIVE_UP)
                return 0;
            room *= 2;
        } else if (static_cast<uint32>(n) >= room) {
            room = static_cast<uint32>(n) + 1;
        } else {
            _size += static_cast<uint32>(n);
            return static_cast<uint32>(n);
        }
    }
}

void Buffer::append_uint16(uint16 x)
{
    append_uint64(x);
}

void Buffer::append_uint32(uint32 x)
{
    append_uint64(x);
}

void Buffer::append_uint64(uint64 x)
{
    char buffer[NUMBER_TEXT_SIZE];
    size_t size;
    const char* digits = uint64_to_str(buffer, x, size);
    append(digits, size);
}

void Buffer::dump() const
{
    constexpr uint32 PER_LINE = 16;
    for (uint32 line = 0; line < _size; line += PER_LINE) {
        const uint32 n = std::min(PER_LINE, _size - line);
        printf("%08X ", line);
        for (uint32 i = 0; i < PER_LINE; i++) {
            if (i < n)
                printf("%02X ", static_cast<unsigned char>(_data[line + i]));
            else
                printf("   ");
        }
        for (uint32 i = 0; i < n; i++) {
            const unsigned char c = static_cast<unsigned char>(_data[line + i]);
            putchar(isprint(c) ? c : '.');
        }
        putchar('\n');
    }
}

} // namespace KPRV

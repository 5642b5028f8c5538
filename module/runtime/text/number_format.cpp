// Of `number_text`, from number to text.
#include "module/runtime/text/number_text.h"

#include <array>

namespace KPRV {

namespace {

/// Text of a number below 128 and its length.
struct Small_Number
{
    char text[4];
    uint8 size;
};

/// Most numbers are small: their texts need no writing.
constexpr std::array<Small_Number, 128> _uint_strings = [] {
    std::array<Small_Number, 128> table = {};
    for (size_t x = 0; x < table.size(); x++) {
        Small_Number& row = table[x];
        if (x >= 100)
            row.text[row.size++] = static_cast<char>('0' + x / 100);
        if (x >= 10)
            row.text[row.size++] = static_cast<char>('0' + x / 10 % 10);
        row.text[row.size++] = static_cast<char>('0' + x % 10);
    }
    return table;
}();

/// Writes from the end of the buffer backwards; gives the beginning.
char* write_digits(char* end, uint64 value)
{
    do {
        *--end = static_cast<char>('0' + value % 10);
        value /= 10;
    } while (value != 0);
    return end;
}

const char* format(char* buffer, uint64 value, bool negative, size_t& size)
{
    if (!negative && value < _uint_strings.size()) {
        size = _uint_strings[value].size;
        return _uint_strings[value].text;
    }
    char* const end = buffer + NUMBER_TEXT_SIZE - 1;
    *end = '\0';
    char* begin = write_digits(end, value);
    if (negative)
        *--begin = '-';
    size = static_cast<size_t>(end - begin);
    return begin;
}

const char* format_signed(char* buffer, sint64 value, size_t& size)
{
    const bool negative = value < 0;
    const uint64 bits = static_cast<uint64>(value);
    return format(buffer, negative ? -bits : bits, negative, size);
}

} // namespace

// clang-format off
const char* uint8_to_str (char* buffer, uint8 value, size_t& size)  { return format(buffer, value, false, size); }
const char* uint16_to_str(char* buffer, uint16 value, size_t& size) { return format(buffer, value, false, size); }
const char* uint32_to_str(char* buffer, uint32 value, size_t& size) { return format(buffer, value, false, size); }
const char* uint64_to_str(char* buffer, uint64 value, size_t& size) { return format(buffer, value, false, size); }
const char* sint8_to_str (char* buffer, sint8 value, size_t& size)  { return format_signed(buffer, value, size); }
const char* sint16_to_str(char* buffer, sint16 value, size_t& size) { return format_signed(buffer, value, size); }
const char* sint32_to_str(char* buffer, sint32 value, size_t& size) { return format_signed(buffer, value, size); }
const char* sint64_to_str(char* buffer, sint64 value, size_t& size) { return format_signed(buffer, value, size); }
// clang-format on

} // namespace KPRV

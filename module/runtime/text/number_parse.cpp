// Of `number_text`, from text to number.
#include "module/runtime/ground/strutil.h"
#include "module/runtime/text/number_text.h"

#include <array>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <locale.h>

namespace KPRV {

namespace {

constexpr size_t MOST_DECIMAL_DIGITS = 20;
constexpr size_t MOST_HEXADECIMAL_DIGITS = 16;
/// So many characters decide between decimal and hexadecimal, and so many digits are parsed without a loop's
/// bound being looked at twice.
constexpr size_t LOOK_AHEAD = 4;

constexpr std::array<uint8, 256> _digit = [] {
    std::array<uint8, 256> table = {};
    for (int c = '0'; c <= '9'; c++)
        table[size_t(c)] = 1;
    return table;
}();

bool is_digit(char c)
{
    return _digit[static_cast<uint8>(c)] != 0;
}

const char* skip_digits(const char* text)
{
    while (is_digit(*text))
        text++;
    return text;
}

/// The value of a hexadecimal digit, -1 for any other character, lower-case letters among them.
int hexadecimal(char c)
{
    if (is_digit(c))
        return c - '0';
    return c >= 'A' && c <= 'F' ? c - 'A' + 10 : -1;
}

int parse_hexadecimal(const char* text, uint64& value)
{
    if (text[0] != '0' || (text[1] != 'x' && text[1] != 'X'))
        return -1;
    const char* const digits = text + 2;
    const size_t n = strnlen(digits, MOST_HEXADECIMAL_DIGITS + 1);
    if (n == 0 || n > MOST_HEXADECIMAL_DIGITS)
        return -1;
    uint64 result = 0;
    unsigned shift = 0;
    for (const char* p = digits + n; p != digits; shift += 4) {
        const int digit = hexadecimal(*--p);
        if (digit < 0)
            return -1;
        result |= static_cast<uint64>(digit) << shift;
    }
    value = result;
    return 0;
}

template <class T>
int parse_unsigned(const char* text, T& value)
{
    uint64 wide;
    if (str_to_uint64(text, wide) != 0 || wide > std::numeric_limits<T>::max())
        return -1;
    value = static_cast<T>(wide);
    return 0;
}

template <class T>
int parse_signed(const char* text, T& value)
{
    const bool negative = *text == '-';
    if (negative || *text == '+')
        text++;
    uint64 magnitude;
    if (str_to_uint64(text, magnitude) != 0)
        return -1;
    // There is one negative number more than positive ones.
    if (magnitude > static_cast<uint64>(std::numeric_limits<T>::max()) + negative)
        return -1;
    value = static_cast<T>(negative ? -magnitude : magnitude);
    return 0;
}

int parse_real(const char* text, real64& value)
{
    const char* const expected = _parse_real(text);
    if (!expected)
        return -1;
    // The server's locale may write its decimals with a comma. This one is a constant of the C library.
    const locale_t plain = newlocale(LC_ALL_MASK, "C", nullptr);
    char* end = nullptr;
    const real64 result = strtod_l(text, &end, plain);
    freelocale(plain);
    if (*end != '\0')
        return -1;
    value = result;
    return 0;
}

} // namespace

int str_to_boolean(const char* text, boolean& value)
{
    if (name_eq(text, "true"))
        value = true;
    else if (name_eq(text, "false"))
        value = false;
    else
        return -1;
    return 0;
}

int str_to_uint64(const char* text, uint64& value)
{
    uint64 result = 0;
    const char* p = text;
    for (; p != text + LOOK_AHEAD && *p; p++) {
        if (!is_digit(*p))
            return parse_hexadecimal(text, value);
        result = 10 * result + static_cast<uint64>(*p - '0');
    }
    if (p == text)
        return -1;
    for (; *p; p++) {
        if (!is_digit(*p) || p == text + MOST_DECIMAL_DIGITS)
            return -1;
        result = 10 * result + static_cast<uint64>(*p - '0');
    }
    value = result;
    return 0;
}

// clang-format off
int str_to_uint8 (const char* text, uint8& value)  { return parse_unsigned(text, value); }
int str_to_uint16(const char* text, uint16& value) { return parse_unsigned(text, value); }
int str_to_uint32(const char* text, uint32& value) { return parse_unsigned(text, value); }
int str_to_sint8 (const char* text, sint8& value)  { return parse_signed(text, value); }
int str_to_sint16(const char* text, sint16& value) { return parse_signed(text, value); }
int str_to_sint32(const char* text, sint32& value) { return parse_signed(text, value); }
int str_to_sint64(const char* text, sint64& value) { return parse_signed(text, value); }
int str_to_real64(const char* text, real64& value) { return parse_real(text, value); }
// clang-format on

int str_to_real32(const char* text, real32& value)
{
    real64 wide;
    if (parse_real(text, wide) != 0)
        return -1;
    value = static_cast<real32>(wide);
    return 0;
}

const char* _parse_real(const char* text)
{
    const auto skip_sign = [](const char* p) { return *p == '+' || *p == '-' ? p + 1 : p; };
    const char* p = skip_digits(skip_sign(text));
    if (*p != '.' || !is_digit(p[1]))
        return nullptr;
    p = skip_digits(p + 1);
    if (*p == 'e' || *p == 'E') {
        p = skip_sign(p + 1);
        if (!is_digit(*p))
            return nullptr;
        p = skip_digits(p);
    }
    return *p == '\0' ? p : nullptr;
}

int find_token(const char* text, const char* delimiters, const char*& start, const char*& end)
{
    const char* const first = text + strspn(text, delimiters);
    if (*first == '\0')
        return -1;
    start = first;
    end = first + strcspn(first, delimiters);
    return 0;
}

} // namespace KPRV

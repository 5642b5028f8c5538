#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

// Numbers from text and back, in a grammar of their own that no locale changes. The parsers take the whole
// text: 0 and the value, or -1 with the value as it was.

/// "true" or "false" in any case.
int str_to_boolean(const char* text, boolean& value);

// Unsigned: up to 20 decimal digits, or "0x" or "0X" and up to 16 hexadecimal ones, letters in upper case
// only. A text whose first four characters are digits is decimal. Decimal figures beyond 64 bits wrap
// silently, before the range of a narrower type is checked.
int str_to_uint8(const char* text, uint8& value);
int str_to_uint16(const char* text, uint16& value);
int str_to_uint32(const char* text, uint32& value);
int str_to_uint64(const char* text, uint64& value);

// Signed: the same behind an optional "+" or "-".
int str_to_sint8(const char* text, sint8& value);
int str_to_sint16(const char* text, sint16& value);
int str_to_sint32(const char* text, sint32& value);
int str_to_sint64(const char* text, sint64& value);

/// The reals of CIM: a "." with at least one digit behind it is a must, so that "1" and "1e5" are none.
/// Signs, digits before the point and a decimal exponent are optional. Too large is infinite.
int str_to_real32(const char* text, real32& value);
int str_to_real64(const char* text, real64& value);
/// Where the text stops being such a real: its end if it is one, else null.
const char* _parse_real(const char* text);

/// Room for the longest figure, its sign and the final zero.
inline constexpr size_t NUMBER_TEXT_SIZE = 22;

// Decimal text of a value, terminated, with its length in `size`. The result lies anywhere in the caller's
// buffer of `NUMBER_TEXT_SIZE` bytes, or in a constant table, the buffer then untouched, for 0 to 127.
const char* uint8_to_str(char* buffer, uint8 value, size_t& size);
const char* uint16_to_str(char* buffer, uint16 value, size_t& size);
const char* uint32_to_str(char* buffer, uint32 value, size_t& size);
const char* uint64_to_str(char* buffer, uint64 value, size_t& size);
const char* sint8_to_str(char* buffer, sint8 value, size_t& size);
const char* sint16_to_str(char* buffer, sint16 value, size_t& size);
const char* sint32_to_str(char* buffer, sint32 value, size_t& size);
const char* sint64_to_str(char* buffer, sint64 value, size_t& size);

/// The next piece of the text between delimiters: passes over leading ones and gives the piece as [start,
/// end). -1, with both as they were, where nothing is left.
int find_token(const char* text, const char* delimiters, const char*& start, const char*& end);

} // namespace KPRV

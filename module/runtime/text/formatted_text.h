#pragma once

#include "module/runtime/ground/String.h"

#include <cstdarg>
#include <cstdio>

namespace KPRV {

/// Text of any length as `printf` makes it, from `malloc`; the caller frees it. Null where the arguments
/// cannot be converted or memory ends.
char* str_printf(const char* format, ...) __attribute__((format(printf, 1, 2)));
char* str_vprintf(const char* format, va_list arguments) __attribute__((format(printf, 1, 0)));

/// The same as a `String`; empty where the other is null.
String string_printf(const char* format, ...) __attribute__((format(printf, 1, 2)));
String string_vprintf(const char* format, va_list arguments) __attribute__((format(printf, 1, 0)));

/// Indents by 4 blanks a level, then prints: to a file, or to standard output.
void ifprintf(FILE* file, size_t level, const char* format, ...) __attribute__((format(printf, 3, 4)));
void iprintf(size_t level, const char* format, ...) __attribute__((format(printf, 2, 3)));

} // namespace KPRV

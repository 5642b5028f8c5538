#pragma once

#include "module/runtime/ground/Array.h"
#include "module/runtime/objects/Meta_Value.h"

#include <cstdio>

namespace KPRV {

/// Writes the text between double quotes, with tab, newline, form feed, carriage return and the double quote
/// as backslash sequences, and all else as it is.
void fprint_string(FILE* file, const char* text);

/// Writes a value of a cell or a `Value`: "true", digits, "%f", 'c' or 0x%04X, or a quoted text.
void fprint_scalar_value(FILE* file, Type type, const void* value);

/// Writes "{ ", the elements joined by ", ", " }"; an empty array is "{ }".
void fprint_array_value(FILE* file, Type type, const __Array_Rep* array);

/// As `fprint_scalar_value`, for the default of a scalar property of that type.
void fprint_scalar(FILE* file, const Meta_Value& value, Type type);

/// The elements of an array property's default, joined by ", ", without braces.
void fprint_array(FILE* file, const Meta_Value& value, Type type);

// The three on standard output.
void print_string(const char* text);
void print_scalar(const Meta_Value& value, Type type);
void print_array(const Meta_Value& value, Type type);

} // namespace KPRV

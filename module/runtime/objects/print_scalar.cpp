#include "module/runtime/objects/print_scalar.h"

#include "module/runtime/ground/type_dispatch.h"

#include <cinttypes>

namespace KPRV {

namespace {

// clang-format off
void write(FILE* file, boolean x)         { fputs(x ? "true" : "false", file); }
void write(FILE* file, uint8 x)           { fprintf(file, "%u", unsigned(x)); }
void write(FILE* file, uint16 x)          { fprintf(file, "%u", unsigned(x)); }
void write(FILE* file, uint32 x)          { fprintf(file, "%u", unsigned(x)); }
void write(FILE* file, sint8 x)           { fprintf(file, "%d", int(x)); }
void write(FILE* file, sint16 x)          { fprintf(file, "%d", int(x)); }
void write(FILE* file, sint32 x)          { fprintf(file, "%d", int(x)); }
void write(FILE* file, uint64 x)          { fprintf(file, "%" PRIu64, x); }
void write(FILE* file, sint64 x)          { fprintf(file, "%" PRId64, x); }
void write(FILE* file, real32 x)          { fprintf(file, "%f", double(x)); }
void write(FILE* file, real64 x)          { fprintf(file, "%f", x); }
void write(FILE* file, const String& x)   { fprint_string(file, x.c_str()); }
void write(FILE* file, const Datetime& x) { fprint_string(file, x.ascii().c_str()); }
// clang-format on

void write(FILE* file, char16 x)
{
    const unsigned code = x;
    fprintf(file, code >= 32 && code <= 126 ? "'%c'" : "0x%04X", code);
}

/// The letter behind the backslash; 0 for a character that stands for itself.
char escape_of(char c)
{
    // clang-format off
    switch (c) {
    case '\t': return 't';
    case '\n': return 'n';
    case '\f': return 'f';
    case '\r': return 'r';
    case '"':  return '"';
    default:   return 0;
    }
    // clang-format on
}

/// A default at an address of the tables, where texts and datetimes stand as C strings.
void write_literal(FILE* file, Type type, const void* literal)
{
    if (type == STRING || type == DATETIME)
        fprint_string(file, *static_cast<const char* const*>(literal));
    else
        fprint_scalar_value(file, type, literal);
}

} // namespace

void fprint_string(FILE* file, const char* text)
{
    putc('"', file);
    for (; *text; text++) {
        if (const char letter = escape_of(*text)) {
            putc('\\', file);
            putc(letter, file);
        } else {
            putc(*text, file);
        }
    }
    putc('"', file);
}

void fprint_scalar_value(FILE* file, Type type, const void* value)
{
    visit_type(type,
               [=](auto tag) { write(file, *static_cast<const typename decltype(tag)::type*>(value)); });
}

void fprint_array_value(FILE* file, Type type, const __Array_Rep* array)
{
    const char* element = static_cast<const char*>(__data(array));
    fputs("{ ", file);
    for (uint32 i = 0; i < array->size; i++, element += array->traits->size) {
        if (i != 0)
            fputs(", ", file);
        fprint_scalar_value(file, type, element);
    }
    fputs(array->size ? " }" : "}", file);
}

void fprint_scalar(FILE* file, const Meta_Value& value, Type type)
{
    write_literal(file, type, &value);
}

void fprint_array(FILE* file, const Meta_Value& value, Type type)
{
    const char* element = static_cast<const char*>(value.array_value.elements);
    for (uint32 i = 0; i < value.array_value.num_elements; i++, element += literal_type_size[type]) {
        if (i != 0)
            fputs(", ", file);
        write_literal(file, type, element);
    }
}

void print_string(const char* text)
{
    fprint_string(stdout, text);
}

void print_scalar(const Meta_Value& value, Type type)
{
    fprint_scalar(stdout, value, type);
}

void print_array(const Meta_Value& value, Type type)
{
    fprint_array(stdout, value, type);
}

} // namespace KPRV

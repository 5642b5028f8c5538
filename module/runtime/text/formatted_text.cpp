#include "module/runtime/text/formatted_text.h"

#include <cstdlib>

namespace KPRV {

namespace {

__attribute__((format(printf, 3, 0))) void print_indented(FILE* file, size_t level, const char* format,
                                                          va_list arguments)
{
    fprintf(file, "%*s", static_cast<int>(4 * level), "");
    vfprintf(file, format, arguments);
}

} // namespace

char* str_vprintf(const char* format, va_list arguments)
{
    // A negative answer once meant "too small" and now means a text that cannot be converted: the doubling
    // ends somewhere.
    constexpr size_t GIVE_UP = size_t(1) << 20;
    char* text = nullptr;
    for (size_t size = 128;;) {
        char* const larger = static_cast<char*>(realloc(text, size));
        if (!larger)
            break;
        text = larger;
        va_list copy;
        va_copy(copy, arguments);
        const int n = vsnprintf(text, size, format, copy);
        va_end(copy);
        if (n >= 0 && static_cast<size_t>(n) < size)
            return text;
        // Either way (boundary): one doubling more in vain shows nowhere, and an empty text is done above.
        if (n < 0 && size >= GIVE_UP)
            break;
        size = n < 0 ? 2 * size : static_cast<size_t>(n) + 1;
    }
    free(text);
    return nullptr;
}

char* str_printf(const char* format, ...)
{
    va_list arguments;
    va_start(arguments, format);
    char* const text = str_vprintf(format, arguments);
    va_end(arguments);
    return text;
}

String string_vprintf(const char* format, va_list arguments)
{
    char* const text = str_vprintf(format, arguments);
    String result = text ? text : "";
    free(text);
    return result;
}

String string_printf(const char* format, ...)
{
    va_list arguments;
    va_start(arguments, format);
    String result = string_vprintf(format, arguments);
    va_end(arguments);
    return result;
}

void ifprintf(FILE* file, size_t level, const char* format, ...)
{
    va_list arguments;
    va_start(arguments, format);
    print_indented(file, level, format, arguments);
    va_end(arguments);
}

void iprintf(size_t level, const char* format, ...)
{
    va_list arguments;
    va_start(arguments, format);
    print_indented(stdout, level, format, arguments);
    va_end(arguments);
}

} // namespace KPRV

#include "module/runtime/system/assert.h"

#include <cstdio>
#include <cstdlib>

namespace KPRV {

void __cimple_assert(const char* file, size_t line, const char* function, const char* text)
{
    fprintf(stderr, "%s(%d): %s(): assert: %s\n\n", file, int(line), function, text);
    abort();
}

void __cimple_trace(const char* file, size_t line, const char* text)
{
    fprintf(stderr, "TRACE: %s(%d): %s\n", file, int(line), text);
}

} // namespace KPRV

#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

/// Writes "%s(%d): %s(): assert: %s\n\n" to standard error and aborts.
[[noreturn]] void __cimple_assert(const char* file, size_t line, const char* function, const char* text);

/// Writes "TRACE: %s(%d): %s\n" to standard error.
void __cimple_trace(const char* file, size_t line, const char* text);

} // namespace KPRV

#define CIMPLE_ASSERT(COND)                                                                                  \
    do {                                                                                                     \
        if (!(COND))                                                                                         \
            ::KPRV::__cimple_assert(__FILE__, __LINE__, __func__, #COND);                                    \
    } while (0)

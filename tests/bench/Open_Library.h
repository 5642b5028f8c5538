#pragma once

#include <string>

namespace KPRV::bench {

// Libraries that a benchmark cannot do without: where one of them or of their functions is missing, the
// program says so and ends.

/// Opens a library, for good.
void* open_library(const char* path);

void* find_symbol(void* library, const std::string& name);

template <class Function>
Function find_function(void* library, const std::string& name)
{
    return reinterpret_cast<Function>(find_symbol(library, name));
}

} // namespace KPRV::bench

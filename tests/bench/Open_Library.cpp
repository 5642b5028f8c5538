#include "tests/bench/Open_Library.h"

#include <cstdio>
#include <cstdlib>
#include <dlfcn.h>

namespace KPRV::bench {

namespace {

void* or_end(void* found)
{
    if (!found) {
        fprintf(stderr, "bench: %s\n", dlerror());
        exit(1);
    }
    return found;
}

} // namespace

void* open_library(const char* path)
{
    return or_end(dlopen(path, RTLD_NOW | RTLD_GLOBAL));
}

void* find_symbol(void* library, const std::string& name)
{
    return or_end(dlsym(library, name.c_str()));
}

} // namespace KPRV::bench

#include "diagnostics/Module_Pin.h"

#include <dlfcn.h>

namespace KPRV {

namespace {

constinit const char anchor = 0;

} // namespace

void pin_module()
{
    // The handle is never given back. A program that has the code in itself finds nothing to hold, and needs
    // nothing.
    Dl_info library = {};
    if (dladdr(&anchor, &library) && library.dli_fname)
        dlopen(library.dli_fname, RTLD_LAZY | RTLD_NOLOAD | RTLD_NODELETE);
}

} // namespace KPRV

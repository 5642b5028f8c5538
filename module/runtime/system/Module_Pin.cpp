#include "module/runtime/system/Module_Pin.h"

#include <dlfcn.h>
#include <utility>

namespace KPRV {

namespace {

constinit const char anchor = 0;

/// Null where there is no library.
void* one_more_handle(int flags)
{
    Dl_info library = {};
    if (!dladdr(&anchor, &library) || !library.dli_fname)
        return nullptr;
    return dlopen(library.dli_fname, RTLD_LAZY | RTLD_NOLOAD | flags);
}

} // namespace

void Module_Pin::hold_for_ever()
{
    one_more_handle(RTLD_NODELETE);
}

void Module_Pin::hold()
{
    if (!_library)
        _library = one_more_handle(0);
}

void Module_Pin::give_back()
{
    if (void* const library = std::exchange(_library, nullptr))
        dlclose(library);
}

} // namespace KPRV

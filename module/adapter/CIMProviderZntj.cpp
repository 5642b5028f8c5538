#include "module/adapter/CIMProviderZntj.h"

#include "module/runtime/system/log.h"

#include <dlfcn.h>

namespace KPRV {

Json::Value default_JsonReqFP(const Json::Value&)
{
    return Json::Value();
}

void default_JsonReqVoidFP(const Json::Value&) {}

const char* default_voidRetStrFP()
{
    return nullptr;
}

uint32 default_voidRetUIntFP()
{
    return 65535;
}

sint32 default_voidRetIntFP()
{
    return -1;
}

void default_evtProcessCBRetVoidFP(evtProcessCB) {}

void default_log4cxxMsgRetVoidFP(log4cxxMsgCB) {}

constinit void* libHandle = nullptr;
constinit bool gZntjLibLoaded = false;

#define ENTRY_POINT(symbol, variable, signature) constinit signature variable = nullptr;
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT

namespace {

template <class Signature>
void resolve(Signature& variable, const char* symbol, Signature stub)
{
    variable = stub;
    if (!libHandle)
        return;
    // A missing symbol overwrites the stub with null: the library answers for itself from here on.
    variable = reinterpret_cast<Signature>(dlsym(libHandle, symbol));
    if (const char* error = dlerror())
        LOG(ERR, "%s not found. %s ", symbol, error);
}

} // namespace

void setupDLLEntryPoints()
{
    LOG(DBG, "inside setupDLLEntryPoints");
    // By its bare name, so that the module's run path decides where it is found.
    libHandle = dlopen("libdzntj.so", RTLD_NOW);
    const char* error = dlerror();
    if (libHandle)
        gZntjLibLoaded = true;
    else
        LOG(DBG, "Error in loading library: %s", error ? error : "");

#define ENTRY_POINT(symbol, variable, signature) resolve(variable, #symbol, &default_##signature);
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT

    LOG(DBG, "Returning: %s", "setupDLLEntryPoints");
}

} // namespace KPRV

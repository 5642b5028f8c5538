#pragma once

#include "module/cmpi/Shared_Ends.h"
#include "module/runtime/objects/Instance.h"

#include <cmpidt.h>
#include <cmpift.h>

namespace KPRV {

/// Where the results of an association operation go, as client data of the handlers below. After the first
/// failure `rc` stays set and later results are dropped; it never reaches the client.
struct Association_Results
{
    const CMPIBroker* broker;
    const CMPIContext* context;
    const CMPIResult* result;
    const char* name_space;
    const char** properties;
    CMPIrc rc;
    Shared_Ends ends = {};
};

// Each takes over the instance; a null instance is the end mark. True for a result that was returned.

/// Far ends that the provider gives as instances.
struct associators1
{
    static bool _proc(Instance* instance, int status, void* client_data);
};

/// Far ends by name, each fetched from the server.
struct associators2
{
    static bool _proc(Instance* instance, int status, void* client_data);
};

/// Far ends by name.
struct associator_names
{
    static bool _proc(Instance* instance, int status, void* client_data);
};

/// Association instances.
struct references_handler
{
    static bool _proc(Instance* instance, int status, void* client_data);
};

/// Association instances by name.
struct reference_names
{
    static bool _proc(Instance* instance, int status, void* client_data);
};

} // namespace KPRV

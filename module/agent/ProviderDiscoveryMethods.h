#pragma once

#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/String.h"

#include <json/value.h>

namespace KPRV {

class JsonRpcManager;

/// The remote procedures: a class-level function for each row of Methods.def, under its handler's name, in
/// the shape of `JsonRpcManager::Handler`. Each turns the positions of "params" into the named query of an
/// entry point, and gives the entry point's answer. It throws
///
///     ErrorParamMismatch     "params" has another number of elements; the counts are in the log, at WARN
///     ErrorBadJsonArray      a parameter that must be an array is none; null counts as one
///     ErrorBadJsonObject     the same with an object
///     Not_Convertible        a parameter of another type than its row tells
///     std::exception         "params" is no array, an element no object, or all of a method's own walk
///     failed
///
/// and lets pass whatever the adapter library throws.
class ProviderDiscoveryMethods
{
public:
#define NONE
#define METHOD(wire, handler, ...) HANDLER(handler, )
#define HANDLER(handler, ...) static void handler(const Json::Value& params, Json::Value& result);
#include "contracts/agent/Methods.def"

    /// Enters all methods that have a wire name.
    static void registerMethods(JsonRpcManager& manager);

    /// Manufacturer and model of the host, in this order, as a hypervisor's own CIM classes tell them; empty
    /// where there are none. Needs the thread context of a CIM request.
    static Array<String> getOtherIdentifyingInfo();
};

} // namespace KPRV

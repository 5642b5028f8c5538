#pragma once

#include <cmpidt.h>
#include <cmpift.h>
#include <string>

namespace KPRV::bench {

/// The rival of the agent's tunnel: a reader, a map of functions and the styled writer, and no CIM at all.
std::string plain_rpc(const std::string& request);

/// The same as a method of a plain provider: it takes the request from the arguments and puts the response
/// among them.
CMPIStatus plain_execute_method(const CMPIResult* result, const CMPIArgs* in, CMPIArgs* out);

} // namespace KPRV::bench

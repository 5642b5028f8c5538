#pragma once

#include <string>

namespace KPRV::bench {

/// The rival of the agent's tunnel: a reader, a map of functions and the styled writer, and no CIM at all.
std::string plain_rpc(const std::string& request);

} // namespace KPRV::bench

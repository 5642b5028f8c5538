#pragma once

#include "kldrcim/connection/Connection.h"

namespace KPRV::kldrcim {

using namespace broker;

/// Sends one text of the agent's JSON-RPC protocol through the CIM method that carries it. The reply stands
/// in `response` of the out parameters; an answer without it is a failure with a message of its own.
Result call_agent(Connection& connection, const std::string& request);

/// The reply of an answer that is ok.
const std::string& agent_reply(const Result& answer);

} // namespace KPRV::kldrcim

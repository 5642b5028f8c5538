#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The verb `rpc`: the agent's JSON-RPC protocol through the CIM method that carries it. Gives the exit
/// status: 1 if the agent, or the provider, answered an error.
int run_rpc(const Cli_Options& options, Connection& connection);

/// False with a one-line `error` for arguments that make no sense together.
bool check_rpc(const Cli_Options& options, std::string& error);

} // namespace KPRV::kldrcim

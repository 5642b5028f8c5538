#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

/// The server that the options name, which is not asked yet. Null with a one-line `error`; `warning` is set
/// for what the user gives up. A build without the libraries that this needs says so.
std::unique_ptr<Connection> open_server(const Cli_Options& options, std::string& error, std::string& warning);

} // namespace KPRV::kldrcim

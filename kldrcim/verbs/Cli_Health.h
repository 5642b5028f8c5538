#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The verb `health`: what is wrong with the host, the worst first. Exit status of a monitoring plugin: 0
/// nothing, 1 warnings, 2 something critical, 3 what nobody can tell.
int run_health(const Cli_Options& options, Connection& connection);

/// False with a one-line `error` for a word of --ignore that is neither a finding nor an address.
bool check_health_options(const Cli_Options& options, std::string& error);

} // namespace KPRV::kldrcim

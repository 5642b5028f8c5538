#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The verbs that stand for one operation of a CIM server: asks, and writes what comes.
int run_operation(const Cli_Options& options, Connection& connection);

} // namespace KPRV::kldrcim

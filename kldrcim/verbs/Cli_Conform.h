#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The verb `conform`: what a client of the Storage HBA profile expects beside what it finds, one row a step.
/// Gives the exit status: 1 if something that has to be there is missing.
int run_conform(const Cli_Options& options, Connection& connection);

} // namespace KPRV::kldrcim

#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The verb `metrics`: the host in numbers, as collectors of metrics read them, on standard output or in a
/// file that is there as a whole or not at all. Status 1 without the host's own system, and where the file
/// cannot be written; other answers that are missing are warned of and counted in the text.
int run_metrics(const Cli_Options& options, Connection& connection);

} // namespace KPRV::kldrcim

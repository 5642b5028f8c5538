#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The verb `luns`: each logical unit once, with the paths that lead to it. Status 1 if the paths cannot be
/// enumerated; other answers that are missing are warned of.
int list_units(const Cli_Options& options, Connection& connection);

} // namespace KPRV::kldrcim

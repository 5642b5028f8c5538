#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The verb `profiles`: the registered profiles with what conforms to each. Exit status 1 with a complaint if
/// the profiles cannot be enumerated; what else cannot be asked is left out with a warning.
int write_profiles(const Cli_Options& options, Connection& connection);

} // namespace KPRV::kldrcim

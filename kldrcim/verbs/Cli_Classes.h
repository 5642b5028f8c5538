#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// `kldrcim classes`: those that have a provider and match the pattern, with superclass, provider kinds,
/// keys.
int list_classes(const Cli_Options& options, Connection& connection);

} // namespace KPRV::kldrcim

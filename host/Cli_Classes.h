#pragma once

#include "host/Cli_Options.h"
#include "host/Host.h"

namespace KPRV::host {

/// `kldrcim classes`: those that have a provider and match the pattern, with superclass, provider kinds,
/// keys.
int list_classes(const Cli_Options& options, Host& host);

} // namespace KPRV::host

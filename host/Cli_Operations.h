#pragma once

#include "host/Cli_Options.h"
#include "host/Host.h"

namespace KPRV::host {

/// The verbs that stand for one operation of a CIM server: asks, and writes what comes.
int run_operation(const Cli_Options& options, Host& host);

} // namespace KPRV::host

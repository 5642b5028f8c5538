#pragma once

#include "broker/Host.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The verbs that stand for one operation of a CIM server: asks, and writes what comes.
int run_operation(const Cli_Options& options, Host& host);

} // namespace KPRV::kldrcim

#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The verb `flash`: asks the module's software installation service to update the firmware of one adapter
/// from a URI, and tells what came of it. Gives the exit status: 0 updated, 1 failed, 2 no such adapter.
int flash(const Cli_Options& options, Connection& connection);

} // namespace KPRV::kldrcim

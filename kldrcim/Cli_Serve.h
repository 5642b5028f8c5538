#pragma once

#include "broker/Local_Server.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

/// `serve`: a CIM server on the module, for any WBEM client, until it is interrupted. A build without the
/// libraries that this needs says so.
int serve(const Cli_Options& options, Local_Server& server);

} // namespace KPRV::kldrcim

#pragma once

#include "host/Cli_Options.h"
#include "host/Host.h"

namespace KPRV::host {

/// The verbs `tree` and `graph`. False with the status of the computer system's enumeration if that fails;
/// `failures` then has it first. Other associations and classes that cannot be asked are in `failures` too,
/// and what they would have shown is left out.
bool write_topology(const Cli_Options& options, Host& host, std::vector<Provider_Failure>& failures);

} // namespace KPRV::host

#pragma once

#include "kldrcim/input/Cli_Options.h"
#include "kldrcim/local/Local_Connection.h"

namespace KPRV::kldrcim {

/// Opens the module that the options name, or the one that is found. Null with a one-line `error` if that
/// cannot be done; `warning` is set for what the user should know of it.
std::unique_ptr<Local_Connection> open_module(const Cli_Options& options, std::string& error,
                                              std::string& warning);

} // namespace KPRV::kldrcim

#pragma once

#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

/// Reads the arguments behind the program's name. False with a one-line `error` for what is not understood,
/// wrong numbers of arguments for the verb included. Options may stand anywhere; "--" ends them.
bool parse_options(const std::vector<std::string>& arguments, Cli_Options& options, std::string& error);

} // namespace KPRV::kldrcim

#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// Results on standard output, in the format of the options.
void write_instances(const Cli_Options& options, const std::vector<Instance_Value>& instances);
/// One instance: the object itself in JSON, a block in the table format.
void write_instance(const Cli_Options& options, const std::vector<Instance_Value>& instances);
void write_paths(const Cli_Options& options, const std::vector<Path_Value>& paths);
/// Return value, then out parameters.
void write_method(const Cli_Options& options, const Request& request, const Result& result);

} // namespace KPRV::kldrcim

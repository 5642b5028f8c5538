#pragma once

#include "broker/values/Request.h"
#include "kldrcim/formats/Result_Writer.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// Writes results on standard output, in the format of the options.
std::unique_ptr<Result_Writer> make_writer(const Cli_Options& options);
/// One instance: the object itself in JSON, a block in the table format.
void write_instance(const Cli_Options& options, const std::vector<Instance_Value>& instances);
/// Return value, then out parameters.
void write_method(const Cli_Options& options, const Request& request, const Result& result);

} // namespace KPRV::kldrcim

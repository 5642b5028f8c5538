#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The verb `watch`: subscribes, writes each indication as it comes, one block each, and unsubscribes when it
/// is interrupted, when the count is reached or when nobody reads any more. 0, or 1 if the provider refuses
/// or the output cannot be written.
int watch(const Cli_Options& options, Connection& connection);

} // namespace KPRV::kldrcim

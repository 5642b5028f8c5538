#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The verb `diag`: `list` shows the hardware tests and what they can be run on; `run TEST ELEMENT` runs one.
/// Exit status of `run`: 0 passed, 1 failed, 3 refused, with the meaning of the return value on standard
/// error; of both: 1 for a CIM status, 2 for a test or an element that is not there.
int diag(const Cli_Options& options, Connection& connection);

} // namespace KPRV::kldrcim

#pragma once

#include "kldrcim/connection/Connection.h"

namespace KPRV::kldrcim {

/// Jobs that the module is still at: their paths with a comma between them. Empty if there are none, and for
/// a module that does not tell.
std::string running_jobs(Connection& connection);

} // namespace KPRV::kldrcim

#pragma once

#include <string>
#include <vector>

namespace KPRV::kldrcim {

/// The command `kldrcim`: runs one verb and writes to standard output and error. The result is the exit
/// status: 0; 1 for a CIM status; 2 for wrong usage or a module that cannot be loaded.
int run_cli(const std::vector<std::string>& arguments);

} // namespace KPRV::kldrcim

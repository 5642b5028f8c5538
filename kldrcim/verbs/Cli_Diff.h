#pragma once

#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

/// The verb `diff`: what came, went and changed between two inventories, as `tree --format json` writes them.
/// Asks nobody. Status 0 if they are equal, 1 if not, 2 if one cannot be read.
int diff_inventories(const Cli_Options& options);

} // namespace KPRV::kldrcim

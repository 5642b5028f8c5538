#pragma once

#include <string>

namespace KPRV::kldrcim {

/// The provider library to open when none is named: beside the executable, else in /usr/lib/cim, else the
/// bare file name, which the loader looks for on its own path.
std::string default_module();

} // namespace KPRV::kldrcim

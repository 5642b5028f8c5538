#pragma once

#include "tests/bench/Lean_Objects.h"

#include <string>

namespace KPRV::bench {

// Results as texts, so that twins can be held against each other.

/// "Class{key=type:value,...}"
std::string text_of(const Lean_Path& path);
/// The path, then "{property=type:value,...}"
std::string text_of(const Lean_Instance& instance);

} // namespace KPRV::bench

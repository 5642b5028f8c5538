#pragma once

#include "kldrcim/walks/Unit_Paths.h"

namespace KPRV::kldrcim {

/// A line a unit with its paths below it, and a last line that counts what is marked.
std::string units_text(const std::vector<Logical_Unit>& units);

/// One object: "units", each with its "paths", and the counts.
std::string units_json(const std::vector<Logical_Unit>& units);

} // namespace KPRV::kldrcim

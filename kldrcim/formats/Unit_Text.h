#pragma once

#include "kldrcim/walks/Unit_Paths.h"

#include <span>

namespace KPRV::kldrcim {

/// A line a unit with its paths below it, and a last line that counts what is marked.
std::string units_text(const std::vector<Logical_Unit>& units);

/// One object: "units", each with its "paths", and the counts.
std::string units_json(const std::vector<Logical_Unit>& units);

/// Each unit of it on a line of its own.
std::string units_json_lines(const std::vector<Logical_Unit>& units);

/// What there is to look for in a unit, by the names of its JSON; those of its paths are lists.
std::span<const char* const> unit_value_names();
std::vector<Named_Value> unit_values(const Logical_Unit& unit);

} // namespace KPRV::kldrcim

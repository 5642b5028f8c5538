#pragma once

#include "broker/values/Class_Catalogue.h"
#include "kldrcim/input/Where_Clause.h"
#include "kldrcim/words/Value_Words.h"

namespace KPRV::kldrcim {

/// Whether a value is as --where wants it: by its number or text, or by the word of its number in any letter
/// case. Of an array any element. An empty text or NULL stands for no value, and null for a property that
/// is not there.
bool holds(const Where_Clause& condition, std::span<const Value_Meaning> meanings, const Plain_Value* value);

/// False with a one-line `error` for a value that the property of that type never has.
bool check_condition(const Class_Catalogue& catalogue, const Class_Info& info, const Where_Clause& condition,
                     std::string& error);

/// Numbers by their size, arrays by their first element that differs, all else by its text.
bool stands_before(const Plain_Value& a, const Plain_Value& b);

} // namespace KPRV::kldrcim

#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace KPRV::kldrcim {

/// What the numbers of a property mean, as the CIM Schema says.
struct Value_Map
{
    std::vector<std::string> numbers;
    std::vector<std::string> words;
};

/// Null for a property whose numbers nobody has asked for yet. The class is the one that declares it first.
const Value_Map* find_value_map(std::string_view class_name, std::string_view property);

} // namespace KPRV::kldrcim

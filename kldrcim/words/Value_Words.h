#pragma once

#include "broker/values/Plain_Value.h"

#include <span>
#include <string>

namespace KPRV::kldrcim {

using namespace broker;

/// Whether what is written says what numbers mean.
enum class Words
{
    SHOWN,
    LEFT_OUT,
};

/// A number of the CIM Schema, or all from `least` to `most`.
struct Value_Meaning
{
    std::uint32_t least;
    std::uint32_t most;
    const char* word;
};

/// As the qualifier `ValueMap` has it: "11", "13..32767", "32768..", ".." for all that is left.
std::string value_map_text(const Value_Meaning& meaning);

/// A property, or a method for what it returns, in a class that has it. Names in lower case.
struct Mapped_Feature
{
    const char* class_name;
    const char* name;
    /// The first that holds is the one.
    std::span<const Value_Meaning> meanings;
};

/// What the catalogue maps, by class and name: generated from module/schema/value_maps.txt.
std::span<const Mapped_Feature> mapped_features();

/// What the numbers of one class mean.
class Class_Words
{
public:
    /// None for a class that the catalogue does not have, and where they are left out.
    explicit Class_Words(std::string_view class_name, Words words = Words::SHOWN);

    /// Empty for a feature without a map.
    std::span<const Value_Meaning> of(std::string_view feature) const;

private:
    std::span<const Mapped_Feature> _features;
};

/// The word of a number; null for one that has none, and for what is no number.
const char* word_of(std::span<const Value_Meaning> meanings, const Plain_Value& number);

/// The value as people read it, "11 (In Service)": plain, but each number with its word. Numbers of an array
/// stand side by side.
std::string worded_text(std::span<const Value_Meaning> meanings, const Plain_Value& value);

} // namespace KPRV::kldrcim

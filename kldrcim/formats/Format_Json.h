#pragma once

#include "kldrcim/words/Value_Words.h"

namespace KPRV::kldrcim {

using namespace broker;

/// JSON with the members in the order of the class, which jsoncpp's sorted objects cannot keep; its quoting
/// of texts is used. References are object paths as text; a NaN or infinity is null.
std::string json_text(const Plain_Value& value, unsigned indent = 0);

/// `{"class": ..., "path": ..., "properties": {...}, "words": {...}}`, nulls included. "words" says what
/// those numbers mean that have a meaning, under the names of the properties; it is left out where there are
/// none.
std::string json_instance(const Instance_Value& instance, unsigned indent = 0, Words words = Words::LEFT_OUT);

/// What the number, or each number of the array, means: a text, or null.
std::string json_words(std::span<const Value_Meaning> meanings, const Plain_Value& value,
                       unsigned indent = 0);

std::string json_string(const std::string& text);

/// A composed text on one line, with its end: no text inside holds a line break.
std::string json_line(const std::string& text);

/// Composed texts between brackets, one a line; "[]" or "{}" if there are none.
std::string json_array(const std::vector<std::string>& elements, unsigned indent = 0);
std::string json_object(const std::vector<std::pair<std::string, std::string>>& members, unsigned indent = 0);

/// One object of a tree, as `tree` and `profiles` write it.
struct Json_Branch
{
    std::string kind;
    std::string what;
    std::string name;
    std::vector<std::string> facts;
    std::string path;
    /// Composed objects.
    std::vector<std::string> children;
};
std::string json_branch(const Json_Branch& branch, unsigned indent = 0);

/// The values as members of an object.
std::string json_values(const std::vector<Named_Value>& values, unsigned indent = 0);

} // namespace KPRV::kldrcim

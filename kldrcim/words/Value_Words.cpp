#include "kldrcim/words/Value_Words.h"

#include "broker/values/Value_Text.h"

#include <algorithm>
#include <limits>

namespace KPRV::kldrcim {

std::string value_map_text(const Value_Meaning& meaning)
{
    if (meaning.least == meaning.most)
        return std::to_string(meaning.least);
    const bool has_least = meaning.least != 0,
               has_most = meaning.most != std::numeric_limits<std::uint32_t>::max();
    return (has_least ? std::to_string(meaning.least) : "") + ".." +
           (has_most ? std::to_string(meaning.most) : "");
}

Class_Words::Class_Words(std::string_view class_name, Words words)
{
    if (words == Words::LEFT_OUT)
        return;
    const std::string name = lower_name(class_name);
    const auto class_of = [](const Mapped_Feature& each) { return std::string_view(each.class_name); };
    // Not equal_range: clang 14 knows no range of two iterators.
    _features = {std::ranges::lower_bound(mapped_features(), name, {}, class_of),
                 std::ranges::upper_bound(mapped_features(), name, {}, class_of)};
}

std::span<const Value_Meaning> Class_Words::of(std::string_view feature) const
{
    const auto found = std::ranges::find_if(
        _features, [&](const Mapped_Feature& each) { return same_name(each.name, feature); });
    return found == _features.end() ? std::span<const Value_Meaning>() : found->meanings;
}

const char* word_of(std::span<const Value_Meaning> meanings, const Plain_Value& number)
{
    if (number.null || !std::holds_alternative<std::uint64_t>(number.data))
        return nullptr;
    const std::uint64_t value = number.as_uint();
    const auto found = std::ranges::find_if(
        meanings, [&](const Value_Meaning& each) { return each.least <= value && value <= each.most; });
    return found == meanings.end() ? nullptr : found->word;
}

std::string worded_text(std::span<const Value_Meaning> meanings, const Plain_Value& value)
{
    if (meanings.empty() || value.null || (value.is_array() && value.elements().empty()))
        return plain_text(value);
    if (!value.is_array()) {
        const char* const word = word_of(meanings, value);
        return plain_text(value) + (word ? " (" + std::string(word) + ")" : "");
    }
    std::string text;
    for (const Plain_Value& element : value.elements())
        text += (text.empty() ? "" : ", ") + worded_text(meanings, element);
    return text;
}

} // namespace KPRV::kldrcim

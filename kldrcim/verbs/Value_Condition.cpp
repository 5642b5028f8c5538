#include "kldrcim/verbs/Value_Condition.h"

#include "broker/values/Path_Parser.h"
#include "broker/values/Type_Words.h"
#include "broker/values/Value_Text.h"
#include "kldrcim/input/Typed_Input.h"

#include <algorithm>
#include <fnmatch.h>

namespace KPRV::kldrcim {

namespace {

bool is_no_value(const std::string& text)
{
    return text.empty() || text == "NULL";
}

bool matches(const std::string& pattern, const std::string& text)
{
    return fnmatch(pattern.c_str(), text.c_str(), FNM_CASEFOLD) == 0;
}

/// Asks no catalogue: this runs while an answer is read, and a server's catalogue would ask on the same
/// connection.
bool equals(const std::string& text, const Plain_Value& value)
{
    if (const Path_Value* const path = value.as_path()) {
        Path_Error error;
        const auto typed = parse_path(text, error);
        return typed && same_object(*typed, *path);
    }
    if (value.type == CMPI_string)
        return value.as_text() == text;
    static const No_Catalogue no_classes;
    Plain_Value typed;
    std::string error;
    return typed_value(no_classes, value.type, text, "", typed, error) && typed == value;
}

bool holds_for_one(const Where_Clause& condition, std::span<const Value_Meaning> meanings,
                   const Plain_Value& value)
{
    const bool is_pattern = condition.kind == Where_Clause::MATCHES;
    if (value.null)
        return is_pattern ? matches(condition.value, "") : is_no_value(condition.value);
    const char* const word = word_of(meanings, value);
    if (is_pattern)
        return matches(condition.value, plain_text(value)) || (word && matches(condition.value, word));
    return equals(condition.value, value) || (word && same_name(word, condition.value));
}

bool is_number(const Plain_Value& value)
{
    return is_integer(value.type) || is_real(value.type);
}

/// Wide enough for each of 64 bits.
long double number_of(const Plain_Value& value)
{
    if (is_real(value.type))
        return value.as_real();
    return is_signed(value.type) ? static_cast<long double>(value.as_sint())
                                 : static_cast<long double>(value.as_uint());
}

} // namespace

bool holds(const Where_Clause& condition, std::span<const Value_Meaning> meanings, const Plain_Value* value)
{
    static const Plain_Value nothing;
    bool is_found = false;
    if (value && value->is_array() && !value->elements().empty())
        is_found = std::ranges::any_of(value->elements(), [&](const Plain_Value& element) {
            return holds_for_one(condition, meanings, element);
        });
    else
        is_found = holds_for_one(condition, meanings, value && !value->is_array() ? *value : nothing);
    return is_found != (condition.kind == Where_Clause::DIFFERS);
}

bool check_condition(const Class_Catalogue& catalogue, const Class_Info& info, const Where_Clause& condition,
                     std::string& error)
{
    const Feature_Info* const property = info.property(condition.name);
    if (!property || condition.kind == Where_Clause::MATCHES || is_no_value(condition.value))
        return true;
    const auto meanings = Class_Words(info.name).of(property->name);
    if (std::ranges::any_of(
            meanings, [&](const Value_Meaning& meaning) { return same_name(meaning.word, condition.value); }))
        return true;
    Plain_Value value;
    const auto element_type = static_cast<CMPIType>(property->type & ~CMPI_ARRAY);
    if (typed_value(catalogue, element_type, condition.value, info.name + "." + property->name, value, error))
        return true;
    error += meanings.empty() ? "" : ", nor is it one of its words";
    return false;
}

bool stands_before(const Plain_Value& a, const Plain_Value& b)
{
    const auto rank = [](const Plain_Value& value) { return value.is_array() ? 2 : !is_number(value); };
    if (rank(a) != rank(b))
        return rank(a) < rank(b);
    if (a.is_array())
        return std::ranges::lexicographical_compare(a.elements(), b.elements(), stands_before);
    return is_number(a) ? number_of(a) < number_of(b) : plain_text(a) < plain_text(b);
}

} // namespace KPRV::kldrcim

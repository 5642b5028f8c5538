#include "kldrcim/input/Typed_Input.h"

#include "broker/values/Datetime_Text.h"
#include "broker/values/Path_Parser.h"
#include "broker/values/Type_Words.h"
#include "kldrcim/input/Cli_Options.h"

#include <charconv>
#include <cstdlib>

namespace KPRV::kldrcim {

namespace {

/// Decimal, or hexadecimal behind 0x; the whole text or nothing.
template <class Number>
bool read_integer(std::string_view text, Number& number)
{
    bool negative = !text.empty() && text[0] == '-';
    int base = 10;
    if (text.starts_with("0x") || text.starts_with("0X")) {
        text.remove_prefix(2);
        base = 16;
        negative = text.starts_with('-');
    }
    if (text.empty() || (negative && base == 16))
        return false;
    auto read = std::from_chars(text.data(), text.data() + text.size(), number, base);
    return read.ec == std::errc() && read.ptr == text.data() + text.size();
}

bool read_real(const std::string& text, double& number)
{
    char* end = nullptr;
    number = std::strtod(text.c_str(), &end);
    return !text.empty() && *end == '\0' && text.find_first_of(" \t") == std::string::npos;
}

std::string trimmed(const std::string& text)
{
    std::size_t from = text.find_first_not_of(" \t\n"), to = text.find_last_not_of(" \t\n");
    return from == std::string::npos ? "" : text.substr(from, to - from + 1);
}

bool is_list(const std::string& text)
{
    return text.size() >= 2 && text.front() == '{' && text.back() == '}';
}

/// Elements of "{a, "b, c"}": commas inside quotes do not count.
std::vector<std::string> list_elements(const std::string& text)
{
    std::vector<std::string> elements;
    std::string element;
    bool in_quotes = false;
    std::string inner = trimmed(text.substr(1, text.size() - 2));
    for (std::size_t i = 0; i < inner.size(); ++i) {
        if (inner[i] == '\\' && in_quotes && i + 1 < inner.size()) {
            element += inner[i++];
        } else if (inner[i] == '"') {
            in_quotes = !in_quotes;
        } else if (inner[i] == ',' && !in_quotes) {
            elements.push_back(trimmed(element));
            element.clear();
            continue;
        }
        element += inner[i];
    }
    if (!inner.empty())
        elements.push_back(trimmed(element));
    return elements;
}

/// A text in quotes is read with its escapes, any other as it stands.
std::string unquoted(const std::string& text)
{
    Path_Error error;
    if (text.size() >= 2 && text.front() == '"' && text.back() == '"')
        if (auto path = parse_path("C.K=" + text, error))
            return path->keys.front().value.as_text();
    return text;
}

std::string path_error_text(const std::string& text, const Path_Error& error)
{
    return "malformed object path at column " + std::to_string(error.column) + ": expected " +
           error.expected + ": " + text;
}

bool typed_scalar(const Class_Catalogue& catalogue, CMPIType type, const std::string& text,
                  Plain_Value& value, std::string& error)
{
    bool fits = true;
    if (type == CMPI_string) {
        value = Plain_Value::text(unquoted(text));
    } else if (type == CMPI_dateTime) {
        value = Plain_Value::datetime(unquoted(text));
        fits = is_datetime_text(value.as_text());
    } else if (type == CMPI_boolean) {
        value = Plain_Value::boolean(same_name(text, "true"));
        fits = value.as_bool() || same_name(text, "false");
    } else if (type == CMPI_ref) {
        Path_Value path;
        if (!typed_path(catalogue, unquoted(text), path, error))
            return false;
        value = Plain_Value::path(std::move(path));
    } else if (is_real(type)) {
        double number = 0;
        fits = read_real(text, number);
        value = Plain_Value::real(type, number);
    } else if (is_signed(type)) {
        std::int64_t number = 0;
        fits = read_integer(text, number) && number >= smallest(type) &&
               number <= static_cast<std::int64_t>(largest(type));
        value = Plain_Value::signed_number(type, number);
    } else if (is_unsigned(type) || type == CMPI_char16) {
        std::uint64_t number = 0;
        fits = read_integer(text, number) && number <= largest(type);
        value = Plain_Value::unsigned_number(type, number);
    } else {
        error = "values of type " + type_word_name(type) + " cannot be given on the command line";
        return false;
    }
    return fits;
}

bool typed_key(const Class_Catalogue& catalogue, const Class_Info& info, Named_Value& key, std::string& error)
{
    const Feature_Info* feature = info.property(key.name);
    if (!feature || !feature->key) {
        error = info.name + " has no key \"" + key.name + "\"";
        return false;
    }
    key.name = feature->name;
    if (is_integer(key.value.type) && is_integer(feature->type)) {
        key.value = with_integer_type(key.value, feature->type);
        return true;
    }
    bool from_text =
        key.value.type == CMPI_string &&
        (feature->type == CMPI_ref || feature->type == CMPI_dateTime || feature->type == CMPI_string);
    if (from_text)
        return feature->type == CMPI_string || typed_value(catalogue, feature->type, key.value.as_text(),
                                                           info.name + "." + key.name, key.value, error);
    if (key.value.type != feature->type)
        error = info.name + "." + key.name + " is a " + type_word_name(feature->type) + ", not a " +
                type_word_name(key.value.type);
    return error.empty();
}

} // namespace

bool typed_path(const Class_Catalogue& catalogue, const std::string& text, Path_Value& path,
                std::string& error)
{
    Path_Error wrong;
    std::optional<Path_Value> parsed = parse_path(text, wrong);
    if (!parsed) {
        error = path_error_text(text, wrong);
        return false;
    }
    path = std::move(*parsed);
    const Class_Info* info = catalogue.find(path.class_name);
    if (!info)
        return true;
    path.class_name = info->name;
    for (Named_Value& key : path.keys)
        if (!typed_key(catalogue, *info, key, error))
            return false;
    return true;
}

bool typed_value(const Class_Catalogue& catalogue, CMPIType type, const std::string& text,
                 const std::string& what, Plain_Value& value, std::string& error)
{
    bool fits = true;
    if (text == "NULL") {
        value = Plain_Value::null_of(type);
    } else if (type & CMPI_ARRAY) {
        CMPIType element_type = static_cast<CMPIType>(type & ~CMPI_ARRAY);
        std::vector<Plain_Value> elements;
        for (const std::string& element : is_list(text) ? list_elements(text) : std::vector{text}) {
            elements.emplace_back();
            fits = fits && typed_scalar(catalogue, element_type, element, elements.back(), error);
        }
        value = Plain_Value::array(element_type, std::move(elements));
    } else {
        fits = typed_scalar(catalogue, type, text, value, error);
    }
    if (!fits && error.empty())
        error = what + " is a " + type_word_name(type) + ", which \"" + text + "\" is not";
    return fits;
}

Plain_Value guessed_value(const std::string& text)
{
    std::uint64_t number = 0;
    std::int64_t negative = 0;
    double real = 0;
    if (text == "NULL")
        return Plain_Value::null_of(CMPI_string);
    if (is_list(text)) {
        std::vector<Plain_Value> elements, texts;
        bool alike = true;
        for (const std::string& element : list_elements(text)) {
            elements.push_back(guessed_value(element));
            texts.push_back(Plain_Value::text(unquoted(element)));
            alike = alike && elements.back().type == elements.front().type;
        }
        CMPIType type = elements.empty() || !alike ? CMPIType(CMPI_string) : elements.front().type;
        return Plain_Value::array(type, alike ? std::move(elements) : std::move(texts));
    }
    if (same_name(text, "true") || same_name(text, "false"))
        return Plain_Value::boolean(same_name(text, "true"));
    if (read_integer(text, number))
        return Plain_Value::unsigned_number(CMPI_uint64, number);
    if (read_integer(text, negative))
        return Plain_Value::signed_number(CMPI_sint64, negative);
    if (!text.empty() && std::string_view("+-.0123456789").find(text[0]) != std::string_view::npos &&
        read_real(text, real))
        return Plain_Value::real(CMPI_real64, real);
    if (is_datetime_text(text))
        return Plain_Value::datetime(text);
    return Plain_Value::text(unquoted(text));
}

bool typed_assignment(const Class_Catalogue& catalogue, const std::string& class_name,
                      const std::string& method, const std::string& text, Named_Value& assignment,
                      std::string& error)
{
    std::string value;
    if (!split_assignment(text, assignment.name, value)) {
        error = "expected NAME=VALUE, not \"" + text + "\"";
        return false;
    }
    const Class_Info* info = catalogue.find(class_name);
    const Method_Info* called = info && !method.empty() ? info->method(method) : nullptr;
    if (!info || (!method.empty() && !called)) {
        assignment.value = guessed_value(value);
        return true;
    }
    const Feature_Info* feature =
        called ? called->parameter(assignment.name) : info->property(assignment.name);
    if (!feature || (called && !feature->in)) {
        error = called ? info->name + "." + called->name + " has no in parameter \"" + assignment.name + "\""
                       : info->name + " has no property \"" + assignment.name + "\"";
        return false;
    }
    assignment.name = feature->name;
    return typed_value(catalogue, feature->type, value, info->name + "." + feature->name, assignment.value,
                       error);
}

bool check_properties(const Class_Catalogue& catalogue, const std::string& class_name,
                      const std::vector<std::string>& names, std::string& error)
{
    const Class_Info* info = catalogue.find(class_name);
    for (const std::string& name : names)
        if (info && !info->property(name)) {
            error = info->name + " has no property \"" + name + "\"";
            return false;
        }
    return true;
}

} // namespace KPRV::kldrcim

#include "kldrcim/wire/Wire_Text.h"

#include "broker/values/Datetime_Text.h"
#include "broker/values/Type_Words.h"

#include <charconv>
#include <cmath>
#include <limits>
#include <optional>

namespace KPRV::kldrcim {

namespace {

constexpr CMPIType named_types[] = {CMPI_boolean, CMPI_string, CMPI_char16, CMPI_uint8,   CMPI_sint8,
                                    CMPI_uint16,  CMPI_sint16, CMPI_uint32, CMPI_sint32,  CMPI_uint64,
                                    CMPI_sint64,  CMPI_real32, CMPI_real64, CMPI_dateTime};

std::string_view without_blanks(std::string_view text)
{
    const std::size_t from = text.find_first_not_of(" \t\r\n");
    if (from == std::string_view::npos)
        return {};
    return text.substr(from, text.find_last_not_of(" \t\r\n") - from + 1);
}

[[noreturn]] void refuse(std::string_view text, CMPIType type)
{
    constexpr std::size_t SHOWN = 80;
    throw Wire_Error::status(CMPI_RC_ERR_TYPE_MISMATCH,
                             "\"" + std::string(text.substr(0, SHOWN)) + "\" is no " + wire_type_name(type));
}

/// One UTF-16 unit; nothing for a text that is not one such character.
std::optional<std::uint16_t> unit_of(std::string_view text)
{
    const auto byte = [&](std::size_t at) { return static_cast<unsigned char>(text[at]); };
    if (text.size() == 1 && byte(0) < 0x80)
        return byte(0);
    if (text.size() == 2 && (byte(0) & 0xE0U) == 0xC0)
        return static_cast<std::uint16_t>((byte(0) & 0x1FU) << 6 | (byte(1) & 0x3FU));
    if (text.size() == 3 && (byte(0) & 0xF0U) == 0xE0)
        return static_cast<std::uint16_t>((byte(0) & 0x0FU) << 12 | (byte(1) & 0x3FU) << 6 |
                                          (byte(2) & 0x3FU));
    return std::nullopt;
}

std::string text_of_unit(std::uint64_t unit)
{
    const auto low = [&](unsigned shift) { return static_cast<char>(0x80 | (unit >> shift & 0x3F)); };
    if (unit < 0x80)
        return {static_cast<char>(unit)};
    if (unit < 0x800)
        return {static_cast<char>(0xC0 | unit >> 6), low(0)};
    return {static_cast<char>(0xE0 | unit >> 12), low(6), low(0)};
}

Plain_Value boolean_of(std::string_view text)
{
    const std::string_view word = without_blanks(text);
    if (same_name(word, "true") || same_name(word, "false"))
        return Plain_Value::boolean(same_name(word, "true"));
    refuse(text, CMPI_boolean);
}

Plain_Value integer_of(std::string_view text, CMPIType type)
{
    std::string_view digits = without_blanks(text);
    const bool negative = digits.starts_with('-');
    if (negative || digits.starts_with('+'))
        digits.remove_prefix(1);
    int base = 10;
    if (digits.starts_with("0x") || digits.starts_with("0X")) {
        base = 16;
        digits.remove_prefix(2);
    }
    std::uint64_t number = 0;
    const char* end = digits.data() + digits.size();
    const auto [at, error] = std::from_chars(digits.data(), end, number, base);
    if (error != std::errc() || at != end)
        refuse(text, type);
    const std::uint64_t bound =
        negative ? std::uint64_t(0) - static_cast<std::uint64_t>(smallest(type)) : largest(type);
    if (number > bound)
        refuse(text, type);
    if (is_unsigned(type))
        return Plain_Value::unsigned_number(type, number);
    return Plain_Value::signed_number(
        type, static_cast<std::int64_t>(negative ? std::uint64_t(0) - number : number));
}

Plain_Value real_of(std::string_view text, CMPIType type)
{
    std::string_view digits = without_blanks(text);
    if (digits.starts_with('+'))
        digits.remove_prefix(1);
    double number = 0;
    const char* end = digits.data() + digits.size();
    const auto [at, error] = std::from_chars(digits.data(), end, number);
    const bool too_large = type == CMPI_real32 && std::isfinite(number) &&
                           std::abs(number) > static_cast<double>(std::numeric_limits<float>::max());
    if (error != std::errc() || at != end || too_large)
        refuse(text, type);
    return Plain_Value::real(type, number);
}

/// Shortest form that reads as the same number; it has a point in any case.
std::string real_text(const Plain_Value& value)
{
    const double number = value.as_real();
    if (std::isnan(number))
        return "NaN";
    if (std::isinf(number))
        return number > 0 ? "INF" : "-INF";
    char buffer[64];
    char* const end = std::end(buffer);
    const auto written = value.type == CMPI_real32 ? std::to_chars(buffer, end, static_cast<float>(number))
                                                   : std::to_chars(buffer, end, number);
    std::string text(buffer, written.ptr);
    if (text.find('.') == std::string::npos)
        text.insert(std::min(text.find('e'), text.size()), ".0");
    return text;
}

} // namespace

std::string wire_type_name(CMPIType type)
{
    const auto element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    if (element == CMPI_ref)
        return "reference";
    return element == CMPI_instance || !is_value_type(element) ? "string" : type_word_name(element);
}

CMPIType wire_type_of(std::string_view name)
{
    for (const CMPIType type : named_types)
        if (same_name(name, type_word_name(type)))
            return type;
    if (same_name(name, "reference"))
        return CMPI_ref;
    return same_name(name, "instance") || same_name(name, "object") ? CMPIType(CMPI_instance)
                                                                    : CMPIType(CMPI_null);
}

const char* key_kind(CMPIType type)
{
    if (type == CMPI_boolean)
        return "boolean";
    return is_integer(type) || is_real(type) ? "numeric" : "string";
}

std::string wire_text(const Plain_Value& value)
{
    if (value.type == CMPI_boolean)
        return value.as_bool() ? "TRUE" : "FALSE";
    if (is_unsigned(value.type))
        return std::to_string(value.as_uint());
    if (is_signed(value.type))
        return std::to_string(value.as_sint());
    if (is_real(value.type))
        return real_text(value);
    return value.type == CMPI_char16 ? text_of_unit(value.as_uint()) : value.as_text();
}

Plain_Value value_of_wire_text(std::string_view text, CMPIType type)
{
    if (type == CMPI_boolean)
        return boolean_of(text);
    if (is_integer(type))
        return integer_of(text, type);
    if (is_real(type))
        return real_of(text, type);
    if (type == CMPI_char16) {
        if (const auto unit = unit_of(text))
            return Plain_Value::unsigned_number(type, *unit);
        refuse(text, type);
    }
    if (type == CMPI_dateTime) {
        const std::string_view moment = without_blanks(text);
        if (!is_datetime_text(moment) && !is_interval_text(moment))
            refuse(text, type);
        return Plain_Value::datetime(std::string(moment));
    }
    return Plain_Value::text(std::string(text));
}

} // namespace KPRV::kldrcim

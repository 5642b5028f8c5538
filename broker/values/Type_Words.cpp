#include "broker/values/Type_Words.h"

#include <algorithm>
#include <array>
#include <iterator>

namespace KPRV::broker {

namespace {

struct Word
{
    CMPIType type;
    const char* name;
    int bits;
};

constexpr Word type_words[] = {
    {CMPI_boolean, "boolean", 1},   {CMPI_char16, "char16", 16}, {CMPI_real32, "real32", 32},
    {CMPI_real64, "real64", 64},    {CMPI_uint8, "uint8", 8},    {CMPI_uint16, "uint16", 16},
    {CMPI_uint32, "uint32", 32},    {CMPI_uint64, "uint64", 64}, {CMPI_sint8, "sint8", 8},
    {CMPI_sint16, "sint16", 16},    {CMPI_sint32, "sint32", 32}, {CMPI_sint64, "sint64", 64},
    {CMPI_instance, "instance", 0}, {CMPI_ref, "ref", 0},        {CMPI_string, "string", 0},
    {CMPI_dateTime, "datetime", 0},
};

/// The places of `type_words` by type, one too high; 0 for a word that is no type of a value.
constexpr auto places = [] {
    std::array<std::uint8_t, CMPI_dateTime + 1> result{};
    for (std::size_t i = 0; i < std::size(type_words); ++i)
        result[type_words[i].type] = static_cast<std::uint8_t>(i + 1);
    return result;
}();

const Word* find_word(CMPIType type)
{
    const std::size_t place = type < places.size() ? places[type] : 0;
    return place ? &type_words[place - 1] : nullptr;
}

int bits_of(CMPIType type)
{
    const Word* word = find_word(type);
    return word ? word->bits : 0;
}

struct Status
{
    int rc;
    const char* name;
};

constexpr Status statuses[] = {
    {0, "CMPI_RC_OK"},
    {1, "CIM_ERR_FAILED"},
    {2, "CIM_ERR_ACCESS_DENIED"},
    {3, "CIM_ERR_INVALID_NAMESPACE"},
    {4, "CIM_ERR_INVALID_PARAMETER"},
    {5, "CIM_ERR_INVALID_CLASS"},
    {6, "CIM_ERR_NOT_FOUND"},
    {7, "CIM_ERR_NOT_SUPPORTED"},
    {8, "CIM_ERR_CLASS_HAS_CHILDREN"},
    {9, "CIM_ERR_CLASS_HAS_INSTANCES"},
    {10, "CIM_ERR_INVALID_SUPERCLASS"},
    {11, "CIM_ERR_ALREADY_EXISTS"},
    {12, "CIM_ERR_NO_SUCH_PROPERTY"},
    {13, "CIM_ERR_TYPE_MISMATCH"},
    {14, "CIM_ERR_QUERY_LANGUAGE_NOT_SUPPORTED"},
    {15, "CIM_ERR_INVALID_QUERY"},
    {16, "CIM_ERR_METHOD_NOT_AVAILABLE"},
    {17, "CIM_ERR_METHOD_NOT_FOUND"},
    {18, "CMPI_RC_NO_MORE_ELEMENTS"},
    {50, "CMPI_RC_DO_NOT_UNLOAD"},
    {51, "CMPI_RC_NEVER_UNLOAD"},
    {60, "CMPI_RC_ERR_INVALID_HANDLE"},
    {61, "CMPI_RC_ERR_INVALID_DATA_TYPE"},
    {100, "CMPI_RC_ERROR_SYSTEM"},
    {200, "CMPI_RC_ERROR"},
};

} // namespace

bool is_value_type(CMPIType type)
{
    return find_word(type) != nullptr;
}
bool is_unsigned(CMPIType type)
{
    return type >= CMPI_uint8 && type <= CMPI_uint64 && find_word(type);
}
bool is_signed(CMPIType type)
{
    return type >= CMPI_sint8 && type <= CMPI_sint64 && find_word(type);
}
bool is_integer(CMPIType type)
{
    return is_unsigned(type) || is_signed(type);
}
bool is_real(CMPIType type)
{
    return type == CMPI_real32 || type == CMPI_real64;
}

std::string type_word_name(CMPIType type)
{
    const Word* word = find_word(static_cast<CMPIType>(type & ~CMPI_ARRAY));
    if (!word)
        return "type " + std::to_string(type);
    std::string name = word->name;
    if (type & CMPI_ARRAY)
        name += "[]";
    return name;
}

std::uint64_t largest(CMPIType type)
{
    int bits = bits_of(type) - (is_signed(type) ? 1 : 0);
    return bits <= 0 ? 0 : ~std::uint64_t(0) >> (64 - bits);
}

std::int64_t smallest(CMPIType type)
{
    return is_signed(type) ? -static_cast<std::int64_t>(largest(type)) - 1 : 0;
}

const char* status_name(int rc)
{
    auto at = std::find_if(std::begin(statuses), std::end(statuses),
                           [&](const Status& status) { return status.rc == rc; });
    return at == std::end(statuses) ? "unknown status" : at->name;
}

std::string code_text(int rc)
{
    return std::string(status_name(rc)) + " (" + std::to_string(rc) + ")";
}

int status_of_name(const std::string& name)
{
    auto at = std::find_if(std::begin(statuses), std::end(statuses),
                           [&](const Status& status) { return name == status.name; });
    return at == std::end(statuses) ? -1 : at->rc;
}

} // namespace KPRV::broker

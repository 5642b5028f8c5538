#pragma once

#include "contracts/cmpi/cmpidt.h"

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace KPRV::broker {

struct Path_Value;
struct Instance_Value;

/// A CIM value of the host: a plain value that owns all it holds and outlives every CMPI call. `type` is a
/// CMPI type word, array bit included; a null value keeps its type and holds nothing.
struct Plain_Value
{
    /// In the place of no value. Not trivial, so that not all alternatives are of the kinds that libstdc++ 12
    /// takes to be always there: a copy that fails for lack of memory would then be destroyed as if it stood.
    struct Nothing
    {
        Nothing() = default;
        Nothing(const Nothing&) noexcept {}
        Nothing& operator=(const Nothing&) noexcept { return *this; }
        bool operator==(const Nothing&) const = default;
    };

    /// Numbers are held widest: unsigned integers and char16 as uint64, signed as sint64, reals as double.
    /// Text holds strings and the 25 characters of a datetime.
    using Data = std::variant<Nothing, bool, std::uint64_t, std::int64_t, double, std::string,
                              std::shared_ptr<const Path_Value>, std::shared_ptr<const Instance_Value>,
                              std::vector<Plain_Value>>;

    CMPIType type = CMPI_null;
    bool null = true;
    Data data;

    static Plain_Value null_of(CMPIType type);
    static Plain_Value boolean(bool value);
    static Plain_Value text(std::string value);
    static Plain_Value datetime(std::string value);
    /// Any unsigned integer word, or char16.
    static Plain_Value unsigned_number(CMPIType type, std::uint64_t value);
    static Plain_Value signed_number(CMPIType type, std::int64_t value);
    static Plain_Value real(CMPIType type, double value);
    static Plain_Value path(Path_Value value);
    static Plain_Value instance(Instance_Value value);
    /// `element_type` comes without the array bit.
    static Plain_Value array(CMPIType element_type, std::vector<Plain_Value> elements);

    bool is_array() const { return (type & CMPI_ARRAY) != 0; }
    CMPIType element_type() const { return static_cast<CMPIType>(type & ~CMPI_ARRAY); }

    /// Readers of a value that is of the kind asked for; otherwise zero, empty or null. The two integer
    /// readers convert between each other and from boolean and char16.
    bool as_bool() const;
    std::uint64_t as_uint() const;
    std::int64_t as_sint() const;
    double as_real() const;
    const std::string& as_text() const;
    const Path_Value* as_path() const;
    const Instance_Value* as_instance() const;
    const std::vector<Plain_Value>& elements() const;
};

bool operator==(const Plain_Value& a, const Plain_Value& b);

/// A property, key binding or argument.
struct Named_Value
{
    std::string name;
    Plain_Value value;
};

bool operator==(const Named_Value& a, const Named_Value& b);

/// The entry of that name, whatever its case; null if none.
const Plain_Value* find_value(const std::vector<Named_Value>& values, std::string_view name);

/// Replaces the value of that name, or appends it under the name as given.
void set_value(std::vector<Named_Value>& values, std::string_view name, Plain_Value value);

struct Path_Value
{
    std::string host = {};
    std::string name_space = {};
    std::string class_name = {};
    std::vector<Named_Value> keys = {};

    const Plain_Value* key(std::string_view name) const { return find_value(keys, name); }
};

/// Class and key bindings as CIM compares them: names without case, integers by number. Host and name space
/// take no part.
bool same_object(const Path_Value& a, const Path_Value& b);
bool operator==(const Path_Value& a, const Path_Value& b);

struct Instance_Value
{
    Path_Value path = {};
    std::vector<Named_Value> properties = {};

    const Plain_Value* property(std::string_view name) const { return find_value(properties, name); }
};

bool operator==(const Instance_Value& a, const Instance_Value& b);

/// The same integer under another integer word: how a key of a path becomes a property of its class.
Plain_Value with_integer_type(const Plain_Value& value, CMPIType type);

/// Names of CIM are compared without case.
bool same_name(std::string_view a, std::string_view b);
std::string lower_name(std::string_view name);
bool contains_name(const std::vector<std::string>& list, std::string_view name);

} // namespace KPRV::broker

#pragma once

#include "broker/values/Plain_Value.h"

namespace KPRV::broker {

/// A property, reference or parameter of a class. Types carry the array bit.
struct Feature_Info
{
    std::string name;
    CMPIType type = CMPI_null;
    bool key = false;
    bool in = false;
    bool out = false;
    /// Class of a reference or embedded instance; empty if the schema does not say.
    std::string target_class;
    /// Default value; null of `type` without one.
    Plain_Value default_value;
};

struct Method_Info
{
    std::string name;
    bool is_static = false;
    CMPIType return_type = CMPI_null;
    std::vector<Feature_Info> parameters;

    const Feature_Info* parameter(std::string_view name) const;
};

struct Class_Info
{
    std::string name;
    /// Empty for a root class.
    std::string superclass;
    bool is_association = false;
    bool is_indication = false;
    bool has_provider = false;
    /// Inherited ones first, in the order of the schema.
    std::vector<Feature_Info> properties;
    std::vector<Method_Info> methods;

    const Feature_Info* property(std::string_view name) const;
    const Method_Info* method(std::string_view name) const;
};

/// The class repository of the server. Names are found whatever their case. Records live as long as the
/// catalogue.
class Class_Catalogue
{
public:
    virtual ~Class_Catalogue() = default;

    /// All classes, or nothing if the module does not tell.
    virtual std::vector<std::string> class_names() const = 0;
    /// Null for an unknown class.
    virtual const Class_Info* find(std::string_view name) const = 0;
    /// Name of the provider module, empty if unknown.
    virtual std::string module_name() const = 0;

    /// True if the class is the ancestor or below it. Without knowledge, true for equal names only.
    virtual bool is_a(std::string_view class_name, std::string_view ancestor) const;
    bool is_known() const { return !class_names().empty(); }
};

/// For modules that do not publish their classes: knows nothing.
class No_Catalogue final : public Class_Catalogue
{
public:
    std::vector<std::string> class_names() const override { return {}; }
    const Class_Info* find(std::string_view) const override { return nullptr; }
    std::string module_name() const override { return {}; }
};

} // namespace KPRV::broker

#pragma once

#include "broker/values/Class_Catalogue.h"

#include <deque>

namespace KPRV::kldrcim {

using namespace broker;

/// A few classes that have each kind of feature.
class Toy_Classes : public Class_Catalogue
{
public:
    Toy_Classes()
    {
        const auto feature = [](const char* name, int type, bool key = false, const char* target = "") {
            Feature_Info info;
            info.name = name;
            info.type = static_cast<CMPIType>(type);
            info.key = key;
            info.target_class = target;
            info.default_value = Plain_Value::null_of(info.type);
            return info;
        };
        const Feature_Info name = feature("Name", CMPI_string, true);
        const Feature_Info size = feature("Size", CMPI_uint8, true);
        const Feature_Info parts = feature("Parts", CMPI_instance | CMPI_ARRAY, false, "Toy_Base");
        Feature_Info color = feature("Color", CMPI_string);
        color.default_value = Plain_Value::text("red & <blue>");
        Method_Info grow;
        grow.name = "Grow";
        grow.is_static = true;
        grow.return_type = CMPI_uint32;
        grow.parameters = {feature("By", CMPI_sint16), feature("Into", CMPI_ref, false, "Toy_Base"),
                           feature("Names", CMPI_stringA), feature("Made", CMPI_instance, false, "Toy_Base")};
        grow.parameters[0].in = grow.parameters[1].in = grow.parameters[2].in = true;
        grow.parameters[3].out = true;
        add("Toy_Base", "", {name}, {});
        add("Toy_Ball", "Toy_Base", {name, size, color, parts}, {grow});
        add("Toy_Link", "",
            {feature("From", CMPI_ref, true, "Toy_Base"), feature("To", CMPI_ref, true, "Toy_Base")}, {});
        _classes.back().is_association = true;
        // What a class declares anew is another thing than what it inherits.
        add("Toy_Ball_Link", "Toy_Link",
            {feature("From", CMPI_ref, true, "Toy_Base"), feature("To", CMPI_ref, true, "Toy_Ball")}, {});
        _classes.back().is_association = true;
        Method_Info shrink = grow;
        shrink.parameters.pop_back();
        color.default_value = Plain_Value::text("blue");
        add("Toy_Small_Ball", "Toy_Ball", {name, size, color, parts}, {shrink});
        // Those have words, which the catalogue knows by class and name.
        add("CIM_EnabledLogicalElement", "", {feature("EnabledState", CMPI_uint16)}, {});
        add("CIM_ManagedSystemElement", "", {feature("OperationalStatus", CMPI_uint16A)}, {});
        add("CIM_RegisteredSpecification", "", {feature("RegisteredOrganization", CMPI_uint16)}, {});
    }

    std::vector<std::string> class_names() const override
    {
        std::vector<std::string> names;
        for (const Class_Info& info : _classes)
            names.push_back(info.name);
        return names;
    }
    const Class_Info* find(std::string_view name) const override
    {
        for (const Class_Info& info : _classes)
            if (same_name(info.name, name))
                return &info;
        return nullptr;
    }
    std::string module_name() const override { return "toy"; }

protected:
    void add(const char* name, const char* superclass, std::vector<Feature_Info> properties,
             std::vector<Method_Info> methods)
    {
        Class_Info info;
        info.name = name;
        info.superclass = superclass;
        info.has_provider = true;
        info.properties = std::move(properties);
        info.methods = std::move(methods);
        _classes.push_back(std::move(info));
    }

    std::deque<Class_Info> _classes;
};

} // namespace KPRV::kldrcim

#include "tests/module/schema/Catalogue_View.h"

#include "module/schema/KALDERA_FCPort.h"

#include <cstdlib>
#include <iostream>
#include <strings.h>

namespace KPRV::catalogue_view {

namespace {

[[noreturn]] void missing(const std::string& what)
{
    std::cerr << "not in the catalogue: " << what << std::endl;
    std::abort();
}

std::string line(const Meta_Feature& feature)
{
    const std::string value = default_text(feature);
    return "[" + flags(feature.flags) + "] " + type(feature) + " " + feature.name +
           (value.empty() ? "" : " = " + value) + "\n";
}

} // namespace

std::vector<const Meta_Class*> classes()
{
    const Meta_Repository* repository = KALDERA_FCPort::static_meta_class.meta_repository;
    return {repository->meta_classes, repository->meta_classes + repository->num_meta_classes};
}

const Meta_Class& find(const std::string& name)
{
    for (const Meta_Class* meta_class : classes())
        if (name == meta_class->name)
            return *meta_class;
    missing("class " + name);
}

uint32 position(const Meta_Class& meta_class, const std::string& feature)
{
    for (uint32 i = 0; i < meta_class.num_meta_features; i++)
        if (feature == meta_class.meta_features[i]->name)
            return i;
    missing(std::string(meta_class.name) + "." + feature);
}

const Meta_Property& as_property(const Meta_Feature& feature)
{
    return static_cast<const Meta_Property&>(feature);
}
const Meta_Reference& as_reference(const Meta_Feature& feature)
{
    return static_cast<const Meta_Reference&>(feature);
}
const Meta_Method& as_method(const Meta_Feature& feature)
{
    return static_cast<const Meta_Method&>(feature);
}

std::string flags(uint32 word, const char* separator)
{
    std::string text;
    for (uint32 bit = 0; bit < num_flag_names; bit++)
        if (word & (1u << bit))
            text += (text.empty() ? "" : separator) + std::string(flag_names[bit]);
    return text;
}

std::string type(const Meta_Feature& feature)
{
    if (feature.flags & FLAG_METHOD)
        return type_name[as_method(feature).return_type];
    if (feature.flags & FLAG_REFERENCE)
        return std::string(as_reference(feature).meta_class->name) +
               (as_reference(feature).subscript ? "[]" : "");
    return std::string(type_name[as_property(feature).type]) + (as_property(feature).subscript ? "[]" : "");
}

std::string default_text(const Meta_Feature& feature)
{
    if (!(feature.flags & FLAG_PROPERTY) || !as_property(feature).value)
        return "";
    const Meta_Value& value = *as_property(feature).value;
    switch (as_property(feature).type) {
    case BOOLEAN:
        return value.boolean_value ? "true" : "false";
    case UINT16:
        return std::to_string(value.uint16_value);
    case UINT32:
        return std::to_string(value.uint32_value);
    case DATETIME:
        return value.string_value;
    default:
        return "a default of a type that no class used before";
    }
}

std::string describe(const Meta_Class& meta_class)
{
    std::string text =
        std::string(meta_class.name) +
        (meta_class.super_meta_class ? std::string(" : ") + meta_class.super_meta_class->name : "") + " [" +
        flags(meta_class.flags) + "] " + std::to_string(meta_class.num_meta_features) + " features, " +
        std::to_string(meta_class.num_keys) + " keys\n";
    for (uint32 i = 0; i < meta_class.num_meta_features; i++)
        if (meta_class.locals[i]) {
            const std::string number = std::to_string(i);
            text += std::string(4 - number.size(), ' ') + number + " " + line(*meta_class.meta_features[i]);
        }
    return text;
}

std::string describe(const std::string& owner, const Meta_Method& method)
{
    std::string text = owner + "." + method.name + " [" + flags(method.flags) + "] " + type(method) + "\n";
    for (uint32 i = 0; i < method.num_meta_features; i++)
        text += "     " + line(*method.meta_features[i]);
    return text;
}

std::vector<const Meta_Feature*> own_features(const Meta_Class& meta_class)
{
    std::vector<const Meta_Feature*> own;
    for (uint32 i = 0; i < meta_class.num_meta_features; i++)
        if (meta_class.locals[i])
            own.push_back(meta_class.meta_features[i]);
    return own;
}

} // namespace KPRV::catalogue_view

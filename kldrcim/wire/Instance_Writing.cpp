#include "kldrcim/wire/Instance_Writing.h"

#include "kldrcim/wire/Wire_Text.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;
using At = Xml_Attribute;

void write_host_and_name_space(Xml_Writer& writer, std::string_view name_space, std::string_view host)
{
    writer.open(Tag::NAMESPACEPATH).open(Tag::HOST).text(host).close(Tag::HOST);
    write_name_space(writer, name_space);
    writer.close(Tag::NAMESPACEPATH);
}

void write_reference(Xml_Writer& writer, const Path_Value& path)
{
    writer.open(Tag::VALUE_REFERENCE);
    if (path.name_space.empty())
        write_instance_name(writer, path);
    else if (path.host.empty())
        write_local_instance_path(writer, path);
    else
        write_instance_path(writer, path, path.host);
    writer.close(Tag::VALUE_REFERENCE);
}

void write_key(Xml_Writer& writer, const Named_Value& key)
{
    writer.open(Tag::KEYBINDING).attribute(At::NAME, key.name);
    if (const Path_Value* path = key.value.as_path())
        write_reference(writer, *path);
    else
        writer.open(Tag::KEYVALUE)
            .attribute(At::VALUETYPE, key_kind(key.value.type))
            .text(key.value.null ? std::string() : wire_text(key.value))
            .close(Tag::KEYVALUE);
    writer.close(Tag::KEYBINDING);
}

/// An instance as the text of a value: its elements, escaped once more.
std::string embedded_text(const Plain_Value& value)
{
    std::string text;
    if (const Instance_Value* instance = value.as_instance()) {
        Xml_Writer writer(text);
        write_instance(writer, *instance);
    }
    return text;
}

/// Neither array nor null.
void write_scalar(Xml_Writer& writer, const Plain_Value& value)
{
    if (const Path_Value* path = value.as_path())
        return write_reference(writer, *path);
    if (value.type == CMPI_string)
        return write_text_value(writer, value.as_text());
    write_text_value(writer, value.type == CMPI_instance ? embedded_text(value) : wire_text(value));
}

bool is_listed(const Property_List& list, std::string_view name)
{
    return !list ||
           std::ranges::any_of(*list, [&](const std::string& each) { return same_name(each, name); });
}

void write_property(Xml_Writer& writer, const Named_Value& property, std::string_view origin)
{
    const CMPIType element = property.value.element_type();
    // A reference has a form of its own; an array of them has none.
    const Tag tag = element == CMPI_ref         ? Tag::PROPERTY_REFERENCE
                    : property.value.is_array() ? Tag::PROPERTY_ARRAY
                                                : Tag::PROPERTY;
    writer.open(tag).attribute(At::NAME, property.name);
    if (element != CMPI_ref)
        writer.attribute(At::TYPE, wire_type_name(element));
    else if (const Path_Value* path = property.value.as_path())
        writer.attribute(At::REFERENCECLASS, path->class_name);
    if (!origin.empty())
        writer.attribute(At::CLASSORIGIN, origin);
    if (element == CMPI_instance)
        writer.attribute(At::EmbeddedObject, "instance");
    write_value(writer, property.value);
    writer.close(tag);
}

/// What RETURNVALUE and PARAMVALUE have in common.
void write_typed_value(Xml_Writer& writer, const Plain_Value& value)
{
    writer.attribute(At::PARAMTYPE, wire_type_name(value.type));
    if (value.element_type() == CMPI_instance)
        writer.attribute(At::EmbeddedObject, "instance");
    write_value(writer, value);
}

} // namespace

void write_name_space(Xml_Writer& writer, std::string_view name_space)
{
    writer.open(Tag::LOCALNAMESPACEPATH);
    while (!name_space.empty()) {
        const std::string_view part = name_space.substr(0, name_space.find('/'));
        if (!part.empty())
            writer.open(Tag::NAMESPACE).attribute(At::NAME, part).empty();
        name_space.remove_prefix(std::min(name_space.size(), part.size() + 1));
    }
    writer.close(Tag::LOCALNAMESPACEPATH);
}

void write_instance_name(Xml_Writer& writer, const Path_Value& path)
{
    writer.open(Tag::INSTANCENAME).attribute(At::CLASSNAME, path.class_name);
    for (const Named_Value& key : path.keys)
        write_key(writer, key);
    writer.close(Tag::INSTANCENAME);
}

void write_local_instance_path(Xml_Writer& writer, const Path_Value& path)
{
    writer.open(Tag::LOCALINSTANCEPATH);
    write_name_space(writer, path.name_space);
    write_instance_name(writer, path);
    writer.close(Tag::LOCALINSTANCEPATH);
}

void write_instance_path(Xml_Writer& writer, const Path_Value& path, std::string_view host)
{
    writer.open(Tag::INSTANCEPATH);
    write_host_and_name_space(writer, path.name_space, path.host.empty() ? host : path.host);
    write_instance_name(writer, path);
    writer.close(Tag::INSTANCEPATH);
}

void write_class_name(Xml_Writer& writer, std::string_view name)
{
    writer.open(Tag::CLASSNAME).attribute(At::NAME, name).empty();
}

void write_class_path(Xml_Writer& writer, std::string_view name_space, std::string_view name,
                      std::string_view host)
{
    writer.open(Tag::CLASSPATH);
    write_host_and_name_space(writer, name_space, host);
    write_class_name(writer, name);
    writer.close(Tag::CLASSPATH);
}

void write_local_class_path(Xml_Writer& writer, std::string_view name_space, std::string_view name)
{
    writer.open(Tag::LOCALCLASSPATH);
    write_name_space(writer, name_space);
    write_class_name(writer, name);
    writer.close(Tag::LOCALCLASSPATH);
}

void write_text_value(Xml_Writer& writer, std::string_view text)
{
    writer.open(Tag::VALUE).text(text).close(Tag::VALUE);
}

void write_text_array(Xml_Writer& writer, const std::vector<std::string>& texts)
{
    writer.open(Tag::VALUE_ARRAY);
    for (const std::string& text : texts)
        write_text_value(writer, text);
    writer.close(Tag::VALUE_ARRAY);
}

void write_value(Xml_Writer& writer, const Plain_Value& value)
{
    if (value.null)
        return;
    if (!value.is_array())
        return write_scalar(writer, value);
    const Tag tag = value.element_type() == CMPI_ref ? Tag::VALUE_REFARRAY : Tag::VALUE_ARRAY;
    writer.open(tag);
    for (const Plain_Value& element : value.elements()) {
        if (element.null)
            writer.open(Tag::VALUE_NULL).empty();
        else
            write_scalar(writer, element);
    }
    writer.close(tag);
}

void write_instance(Xml_Writer& writer, const Instance_Value& instance, const Instance_Form& form)
{
    writer.open(Tag::INSTANCE).attribute(At::CLASSNAME, instance.path.class_name);
    for (const Named_Value& property : instance.properties) {
        if (!is_listed(form.properties, property.name) ||
            (form.seen_as && !form.seen_as->property(property.name)))
            continue;
        write_property(writer, property,
                       form.origins
                           ? origin_of_property(*form.origins, instance.path.class_name, property.name)
                           : std::string());
    }
    writer.close(Tag::INSTANCE);
}

void write_parameter(Xml_Writer& writer, const Named_Value& parameter)
{
    writer.open(Tag::PARAMVALUE).attribute(At::NAME, parameter.name);
    write_typed_value(writer, parameter.value);
    writer.close(Tag::PARAMVALUE);
}

void write_return_value(Xml_Writer& writer, const Plain_Value& value)
{
    writer.open(Tag::RETURNVALUE);
    write_typed_value(writer, value);
    writer.close(Tag::RETURNVALUE);
}

std::string origin_of_property(const Class_Catalogue& catalogue, std::string_view class_name,
                               std::string_view property)
{
    std::string origin;
    for (const Class_Info* each = catalogue.find(class_name); each && each->property(property);
         each = catalogue.find(each->superclass))
        origin = each->name;
    return origin;
}

} // namespace KPRV::kldrcim

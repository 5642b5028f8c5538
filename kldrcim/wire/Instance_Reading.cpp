#include "kldrcim/wire/Instance_Reading.h"

#include "broker/values/Path_Parser.h"
#include "broker/values/Type_Words.h"
#include "kldrcim/wire/Wire_Text.h"
#include "kldrcim/wire/Xml_Reader.h"

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;
using At = Xml_Attribute;

/// Of instances in instances.
constexpr unsigned DEEPEST = 16;
/// Of one path; whoever compares paths looks at each key for each other one.
constexpr std::size_t MOST_KEYS = 256;

std::string required(Xml_Node node, At attribute)
{
    if (!node.has(attribute))
        throw Wire_Error::not_valid("<" + std::string(name_of(node.tag())) + "> without " +
                                    std::string(name_of(attribute)));
    return std::string(node.attribute(attribute));
}

Xml_Node required(Xml_Node node, Tag tag)
{
    const Xml_Node child = node.child(tag);
    if (!child)
        throw Wire_Error::not_valid("<" + std::string(name_of(node.tag())) + "> without <" +
                                    std::string(name_of(tag)) + ">");
    return child;
}

bool is_embedded(Xml_Node node)
{
    return node.has(At::EmbeddedObject) || node.has(At::EMBEDDEDOBJECT);
}

bool is_array(Xml_Node value)
{
    return value.is(Tag::VALUE_ARRAY) || value.is(Tag::VALUE_REFARRAY);
}

/// A number of a type that nobody declares.
Plain_Value undeclared_number(std::string_view text)
{
    if (text.find_first_of(".eEnN") != std::string_view::npos && text.find_first_of("xX") == text.npos)
        return value_of_wire_text(text, CMPI_real64);
    return value_of_wire_text(text, text.find('-') == text.npos ? CMPI_uint64 : CMPI_sint64);
}

/// The type of a value by its own elements, where nothing declares one.
CMPIType undeclared_type(Xml_Node value, CMPIType named)
{
    CMPIType type = named;
    if (value.is(Tag::VALUE_REFERENCE) || value.is(Tag::VALUE_REFARRAY))
        type = CMPI_ref;
    else if (type == CMPI_null)
        type = CMPI_string;
    return is_array(value) ? static_cast<CMPIType>(type | CMPI_ARRAY) : type;
}

const Feature_Info* only_key(const Class_Info& info)
{
    const Feature_Info* found = nullptr;
    for (const Feature_Info& each : info.properties)
        if (each.key) {
            if (found)
                return nullptr;
            found = &each;
        }
    return found;
}

} // namespace

std::string Instance_Reader::name_space(Xml_Node node)
{
    std::string path;
    for (const Xml_Node part : node.children()) {
        if (!path.empty())
            path += '/';
        path += required(part, At::NAME);
    }
    const std::size_t from = path.find_first_not_of('/');
    if (from == std::string::npos)
        throw Wire_Error::not_valid("<LOCALNAMESPACEPATH> without <NAMESPACE>");
    return path.substr(from, path.find_last_not_of('/') - from + 1);
}

Path_Value Instance_Reader::path(Xml_Node node) const
{
    Path_Value path;
    switch (node.tag()) {
    case Tag::OBJECTPATH:
    case Tag::VALUE_REFERENCE:
        if (!node.first())
            throw Wire_Error::not_valid("<" + std::string(name_of(node.tag())) + "> without a path");
        return this->path(node.first());
    case Tag::INSTANCEPATH:
    case Tag::CLASSPATH: {
        const Xml_Node where = required(node, Tag::NAMESPACEPATH);
        path = this->path(required(node, node.is(Tag::CLASSPATH) ? Tag::CLASSNAME : Tag::INSTANCENAME));
        path.host = required(where, Tag::HOST).text();
        path.name_space = name_space(required(where, Tag::LOCALNAMESPACEPATH));
        return path;
    }
    case Tag::LOCALINSTANCEPATH:
    case Tag::LOCALCLASSPATH:
        path = this->path(required(node, node.is(Tag::LOCALCLASSPATH) ? Tag::CLASSNAME : Tag::INSTANCENAME));
        path.name_space = name_space(required(node, Tag::LOCALNAMESPACEPATH));
        return path;
    case Tag::CLASSNAME:
        path.class_name = required(node, At::NAME);
        return path;
    case Tag::INSTANCENAME: {
        path.class_name = required(node, At::CLASSNAME);
        const Class_Info* owner = _catalogue.find(path.class_name);
        for (const Xml_Node each : node.children()) {
            if (path.keys.size() == MOST_KEYS)
                throw Wire_Error::status(CMPI_RC_ERR_INVALID_PARAMETER,
                                         path.class_name.substr(0, 64) + " has not so many keys");
            path.keys.push_back(key(each, owner));
        }
        return path;
    }
    default:
        throw Wire_Error::not_valid("<" + std::string(name_of(node.tag())) + "> is no path");
    }
}

Named_Value Instance_Reader::key(Xml_Node node, const Class_Info* owner) const
{
    if (node.is(Tag::KEYBINDING)) {
        const std::string name = required(node, At::NAME);
        if (!node.first())
            throw Wire_Error::not_valid("<KEYBINDING> without a value");
        return {name, key_value(node.first(), owner ? owner->property(name) : nullptr)};
    }
    // An only key may come without its name.
    const Feature_Info* declared = owner ? only_key(*owner) : nullptr;
    return {declared ? declared->name : std::string(), key_value(node, declared)};
}

Plain_Value Instance_Reader::key_value(Xml_Node node, const Feature_Info* declared) const
{
    if (node.is(Tag::VALUE_REFERENCE))
        return Plain_Value::path(path(node));
    const std::string_view text = node.text();
    if (declared && declared->type == CMPI_ref) {
        Path_Error error;
        if (const std::optional<Path_Value> path = parse_path(text, error))
            return Plain_Value::path(*path);
        throw Wire_Error::status(CMPI_RC_ERR_TYPE_MISMATCH, declared->name + " is no reference");
    }
    if (declared && !declared->type)
        declared = nullptr;
    const CMPIType named = wire_type_of(node.attribute(At::TYPE));
    if (declared || named != CMPI_null)
        return value_of_wire_text(text, declared ? declared->type : named);
    const std::string_view kind = node.attribute(At::VALUETYPE);
    if (kind == "numeric")
        return undeclared_number(text);
    return value_of_wire_text(text, kind == "boolean" ? CMPI_boolean : CMPI_string);
}

Plain_Value Instance_Reader::scalar(Xml_Node node, CMPIType type) const
{
    if (node.is(Tag::VALUE_NULL))
        return Plain_Value::null_of(type);
    if (node.is(Tag::VALUE_REFERENCE) != (type == CMPI_ref))
        throw Wire_Error::status(CMPI_RC_ERR_TYPE_MISMATCH, "<" + std::string(name_of(node.tag())) +
                                                                "> is no value of type " +
                                                                type_word_name(type));
    if (type == CMPI_ref)
        return Plain_Value::path(path(node));
    return type == CMPI_instance ? embedded(node.text()) : value_of_wire_text(node.text(), type);
}

Plain_Value Instance_Reader::value(Xml_Node node, CMPIType type) const
{
    if (!node)
        return Plain_Value::null_of(type);
    const bool wanted = (type & CMPI_ARRAY) != 0;
    const auto element_type = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    if (is_array(node) != wanted) {
        // Some clients cannot tell an array of one from its element.
        if (wanted)
            return Plain_Value::array(element_type, {scalar(node, element_type)});
        throw Wire_Error::status(CMPI_RC_ERR_TYPE_MISMATCH, "an array is no " + type_word_name(type));
    }
    if (!wanted)
        return scalar(node, type);
    std::vector<Plain_Value> elements;
    std::size_t count = 0;
    for ([[maybe_unused]] const Xml_Node each : node.children())
        ++count;
    elements.reserve(count);
    for (const Xml_Node each : node.children())
        elements.push_back(scalar(each, element_type));
    return Plain_Value::array(element_type, std::move(elements));
}

Plain_Value Instance_Reader::embedded(std::string_view text) const
{
    Xml_Reader reader;
    if (_depth == DEEPEST || !reader.feed(text) || !reader.finish())
        throw Wire_Error::status(CMPI_RC_ERR_INVALID_PARAMETER,
                                 _depth == DEEPEST ? "instances are embedded too deep"
                                                   : "no embedded instance: " + reader.fault_text());
    if (!reader.document().root().is(Tag::INSTANCE))
        throw Wire_Error::status(CMPI_RC_ERR_TYPE_MISMATCH, "what is embedded is no instance");
    Instance_Reader inner(*this);
    ++inner._depth;
    return Plain_Value::instance(inner.instance(reader.document().root()));
}

Named_Value Instance_Reader::property(Xml_Node node, const Class_Info* owner) const
{
    const std::string name = required(node, At::NAME);
    const Feature_Info* declared = owner ? owner->property(name) : nullptr;
    Xml_Node held;
    for (const Xml_Node each : node.children())
        if (!each.is(Tag::QUALIFIER))
            held = each;
    CMPIType type = declared ? declared->type : CMPIType(CMPI_null);
    if (type == CMPI_null) {
        type = node.is(Tag::PROPERTY_REFERENCE) ? CMPIType(CMPI_ref) : wire_type_of(required(node, At::TYPE));
        if (type == CMPI_null)
            throw Wire_Error::not_valid("no type \"" + std::string(node.attribute(At::TYPE)) + "\"");
        if (node.is(Tag::PROPERTY_ARRAY))
            type = static_cast<CMPIType>(type | CMPI_ARRAY);
        if (is_embedded(node))
            type = static_cast<CMPIType>(CMPI_instance | (type & CMPI_ARRAY));
    }
    return {name, value(held, type)};
}

Instance_Value Instance_Reader::instance(Xml_Node node) const
{
    if (!node.is(Tag::INSTANCE))
        throw Wire_Error::not_valid("no <INSTANCE>");
    Instance_Value instance;
    instance.path.class_name = required(node, At::CLASSNAME);
    const Class_Info* owner = _catalogue.find(instance.path.class_name);
    for (const Xml_Node each : node.children())
        if (!each.is(Tag::QUALIFIER))
            instance.properties.push_back(property(each, owner));
    return instance;
}

Instance_Value Instance_Reader::instance_with_path(Xml_Node node) const
{
    Instance_Value result = instance(required(node, Tag::INSTANCE));
    result.path = path(node.first());
    return result;
}

Named_Value Instance_Reader::parameter(Xml_Node node, const Feature_Info* declared) const
{
    const CMPIType named =
        is_embedded(node) ? CMPIType(CMPI_instance) : wire_type_of(node.attribute(At::PARAMTYPE));
    const CMPIType type = declared && declared->type ? declared->type : undeclared_type(node.first(), named);
    const Xml_Node held = node.first();
    // Where a value stands as itself, not as its text.
    if (held.is(Tag::INSTANCE))
        return {required(node, At::NAME), Plain_Value::instance(instance(held))};
    if (held.is(Tag::INSTANCENAME) || held.is(Tag::CLASSNAME))
        return {required(node, At::NAME), Plain_Value::path(path(held))};
    return {required(node, At::NAME), value(held, type)};
}

Plain_Value Instance_Reader::return_value(Xml_Node node) const
{
    const CMPIType named =
        is_embedded(node) ? CMPIType(CMPI_instance) : wire_type_of(node.attribute(At::PARAMTYPE));
    return value(node.first(), undeclared_type(node.first(), named));
}

} // namespace KPRV::kldrcim

#include "kldrcim/wire/Class_Xml.h"

#include "kldrcim/wire/Instance_Reading.h"
#include "kldrcim/wire/Qualifiers.h"
#include "kldrcim/wire/Wire_Text.h"
#include "kldrcim/words/Value_Words.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;
using At = Xml_Attribute;

/// A class whose features know nobody else: the reader needs no types but those that stand there.
const No_Catalogue no_catalogue;

bool is_rest(const Value_Meaning& meaning)
{
    return value_map_text(meaning) == "..";
}

/// Clients take what has no end to go as far as its neighbours: numbers ascend, and what is left of them
/// stands in front of the last range.
std::vector<Value_Meaning> in_order_of_numbers(std::span<const Value_Meaning> meanings)
{
    std::vector<Value_Meaning> ordered(meanings.begin(), meanings.end());
    std::ranges::sort(ordered, {},
                      [](const Value_Meaning& each) { return std::pair(is_rest(each), each.least); });
    const std::size_t count = ordered.size();
    if (count > 1 && is_rest(ordered[count - 1]) && ordered[count - 2].least != ordered[count - 2].most)
        std::swap(ordered[count - 1], ordered[count - 2]);
    return ordered;
}

bool same_meanings(std::span<const Value_Meaning> a, std::span<const Value_Meaning> b)
{
    return std::ranges::equal(a, b, [](const Value_Meaning& one, const Value_Meaning& other) {
        return one.least == other.least && one.most == other.most && std::string_view(one.word) == other.word;
    });
}

bool same_declaration(const Feature_Info& a, const Feature_Info& b)
{
    return a.type == b.type && a.key == b.key && a.in == b.in && a.out == b.out &&
           same_name(a.target_class, b.target_class) && a.default_value == b.default_value;
}

bool same_declaration(const Method_Info& a, const Method_Info& b)
{
    return a.is_static == b.is_static && a.return_type == b.return_type &&
           std::ranges::equal(a.parameters, b.parameters, [](const auto& one, const auto& other) {
               return same_name(one.name, other.name) && same_declaration(one, other);
           });
}

class Class_Writer
{
public:
    Class_Writer(Xml_Writer& writer, const Class_Catalogue& catalogue, const Class_Info& info,
                 const Class_Form& form)
        : _writer(writer), _catalogue(catalogue), _info(info), _form(form),
          _superclass(catalogue.find(info.superclass))
    {
    }

    void write()
    {
        _writer.open(Tag::CLASS).attribute(At::NAME, _info.name);
        if (!_info.superclass.empty())
            _writer.attribute(At::SUPERCLASS, _info.superclass);
        if (_form.qualifiers && _info.is_association)
            write_qualifier(_writer, "Association");
        if (_form.qualifiers && _info.is_indication)
            write_qualifier(_writer, "Indication");
        for (const Feature_Info& property : _info.properties)
            if (is_wanted(property))
                write_property(property);
        for (const Method_Info& method : _info.methods)
            if (!_form.local_only || is_own(method, _superclass ? _superclass->method(method.name) : nullptr))
                write_method(method);
        _writer.close(Tag::CLASS);
    }

private:
    bool is_wanted(const Feature_Info& property) const
    {
        return (!_form.local_only || is_own(property, inherited(property))) &&
               (!_form.properties || std::ranges::any_of(*_form.properties, [&](const std::string& name) {
                   return same_name(name, property.name);
               }));
    }

    const Feature_Info* inherited(const Feature_Info& property) const
    {
        return _superclass ? _superclass->property(property.name) : nullptr;
    }

    /// True for what the class declares, or declares anew: what is known of it is not what was inherited.
    template <class Info>
    bool is_own(const Info& info, const Info* inherited) const
    {
        return !inherited || !same_declaration(info, *inherited) ||
               !same_meanings(_words.of(info.name), _inherited_words.of(info.name));
    }

    void write_origin(const std::string& origin, bool is_own)
    {
        if (_form.origins)
            _writer.attribute(At::CLASSORIGIN, origin);
        if (!is_own)
            _writer.attribute(At::PROPAGATED, "true");
    }

    /// Tag, name and type of a property or parameter.
    void open(const Feature_Info& feature, Tag plain, Tag array, Tag reference, Tag references)
    {
        const bool is_array = (feature.type & CMPI_ARRAY) != 0;
        const bool is_reference = (feature.type & ~CMPI_ARRAY) == CMPI_ref;
        _latest = is_reference ? is_array ? references : reference : is_array ? array : plain;
        _writer.open(_latest).attribute(At::NAME, feature.name);
        if (!is_reference)
            _writer.attribute(At::TYPE, wire_type_name(feature.type));
        else if (!feature.target_class.empty())
            _writer.attribute(At::REFERENCECLASS, feature.target_class);
    }

    void write_embedded_class(const Feature_Info& feature)
    {
        if ((feature.type & ~CMPI_ARRAY) == CMPI_instance)
            write_qualifier(_writer, "EmbeddedInstance", feature.target_class);
    }

    void write_property(const Feature_Info& property)
    {
        const std::string origin = origin_of_property(_catalogue, _info.name, property.name);
        open(property, Tag::PROPERTY, Tag::PROPERTY_ARRAY, Tag::PROPERTY_REFERENCE, Tag::PROPERTY_ARRAY);
        write_origin(origin, is_own(property, inherited(property)));
        if (_form.qualifiers) {
            if (property.key)
                write_qualifier(_writer, "Key");
            write_embedded_class(property);
            write_words(property.name);
        }
        write_value(_writer, property.default_value);
        _writer.close(_latest);
    }

    void write_words(const std::string& feature)
    {
        std::vector<std::string> numbers, words;
        for (const Value_Meaning& meaning : in_order_of_numbers(_words.of(feature))) {
            numbers.push_back(value_map_text(meaning));
            words.push_back(meaning.word);
        }
        if (words.empty())
            return;
        write_qualifier(_writer, "ValueMap", numbers);
        write_qualifier(_writer, "Values", words);
    }

    std::string origin_of_method(const std::string& name) const
    {
        std::string origin;
        for (const Class_Info* each = &_info; each && each->method(name);
             each = _catalogue.find(each->superclass))
            origin = each->name;
        return origin;
    }

    void write_method(const Method_Info& method)
    {
        _writer.open(Tag::METHOD).attribute(At::NAME, method.name);
        if (method.return_type != CMPI_null)
            _writer.attribute(At::TYPE, wire_type_name(method.return_type));
        write_origin(origin_of_method(method.name),
                     is_own(method, _superclass ? _superclass->method(method.name) : nullptr));
        if (_form.qualifiers && method.is_static)
            write_qualifier(_writer, "Static");
        if (_form.qualifiers)
            write_words(method.name);
        for (const Feature_Info& parameter : method.parameters) {
            open(parameter, Tag::PARAMETER, Tag::PARAMETER_ARRAY, Tag::PARAMETER_REFERENCE,
                 Tag::PARAMETER_REFARRAY);
            if (_form.qualifiers)
                write_direction(parameter);
            _writer.close(_latest);
        }
        _writer.close(Tag::METHOD);
    }

    void write_direction(const Feature_Info& parameter)
    {
        write_qualifier(_writer, "In", parameter.in ? "TRUE" : "FALSE");
        if (parameter.out)
            write_qualifier(_writer, "Out");
        write_embedded_class(parameter);
    }

    Xml_Writer& _writer;
    const Class_Catalogue& _catalogue;
    const Class_Info& _info;
    const Class_Form& _form;
    const Class_Info* _superclass;
    const Class_Words _words{_info.name};
    const Class_Words _inherited_words{_info.superclass};
    Tag _latest = Tag::PROPERTY;
};

/// The text of a qualifier; nothing if the element has none of that name.
std::optional<std::string> qualifier(Xml_Node node, std::string_view name)
{
    for (const Xml_Node each : node.children())
        if (each.is(Tag::QUALIFIER) && same_name(each.attribute(At::NAME), name))
            return std::string(each.child(Tag::VALUE).text());
    return std::nullopt;
}

bool flag(Xml_Node node, std::string_view name, bool otherwise = false)
{
    const auto text = qualifier(node, name);
    return text ? same_name(*text, "true") : otherwise;
}

Feature_Info read_feature(Xml_Node node)
{
    Feature_Info info;
    info.name = node.attribute(At::NAME);
    const auto embedded = qualifier(node, "EmbeddedInstance");
    const bool is_reference = node.is(Tag::PROPERTY_REFERENCE) || node.is(Tag::PARAMETER_REFERENCE) ||
                              node.is(Tag::PARAMETER_REFARRAY);
    CMPIType type = is_reference ? CMPIType(CMPI_ref) : wire_type_of(node.attribute(At::TYPE));
    if (info.name.empty() || type == CMPI_null)
        throw Wire_Error::not_valid("a feature of a class without name or type");
    if (embedded || node.has(At::EmbeddedObject) || node.has(At::EMBEDDEDOBJECT) ||
        flag(node, "EmbeddedObject"))
        type = CMPI_instance;
    info.target_class =
        is_reference ? std::string(node.attribute(At::REFERENCECLASS)) : embedded.value_or("");
    if (node.is(Tag::PROPERTY_ARRAY) || node.is(Tag::PARAMETER_ARRAY) || node.is(Tag::PARAMETER_REFARRAY))
        type = static_cast<CMPIType>(type | CMPI_ARRAY);
    info.type = type;
    info.key = flag(node, "Key");
    info.in = flag(node, "In", true);
    info.out = flag(node, "Out");
    Xml_Node value;
    for (const Xml_Node each : node.children())
        if (!each.is(Tag::QUALIFIER))
            value = each;
    info.default_value = Instance_Reader(no_catalogue).value(value, type);
    return info;
}

Method_Info read_method(Xml_Node node)
{
    Method_Info info;
    info.name = node.attribute(At::NAME);
    info.is_static = flag(node, "Static");
    info.return_type = wire_type_of(node.attribute(At::TYPE));
    for (const Xml_Node each : node.children())
        if (!each.is(Tag::QUALIFIER))
            info.parameters.push_back(read_feature(each));
    return info;
}

} // namespace

void write_class(Xml_Writer& writer, const Class_Catalogue& catalogue, const Class_Info& info,
                 const Class_Form& form)
{
    Class_Writer(writer, catalogue, info, form).write();
}

Class_Info read_class(Xml_Node node)
{
    if (!node.is(Tag::CLASS) || !node.has(At::NAME))
        throw Wire_Error::not_valid("no <CLASS> with a name");
    Class_Info info;
    info.name = node.attribute(At::NAME);
    info.superclass = node.attribute(At::SUPERCLASS);
    info.is_association = flag(node, "Association");
    info.is_indication = flag(node, "Indication");
    info.has_provider = true;
    for (const Xml_Node each : node.children()) {
        if (each.is(Tag::METHOD))
            info.methods.push_back(read_method(each));
        else if (!each.is(Tag::QUALIFIER)) {
            info.properties.push_back(read_feature(each));
            info.properties.back().in = info.properties.back().out = false;
        }
    }
    return info;
}

} // namespace KPRV::kldrcim

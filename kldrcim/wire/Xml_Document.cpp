#include "kldrcim/wire/Xml_Document.h"

namespace KPRV::kldrcim {

Xml_Tag Xml_Node::tag() const
{
    return _document->_nodes[_index].tag;
}

std::string_view Xml_Node::text() const
{
    if (!_document)
        return {};
    const auto& element = _document->_nodes[_index];
    return std::string_view(_document->_text).substr(element.text, element.text_size);
}

bool Xml_Node::has(Xml_Attribute attribute) const
{
    return _document && _document->find(_document->_nodes[_index], attribute);
}

std::string_view Xml_Node::attribute(Xml_Attribute attribute) const
{
    const auto* found = _document ? _document->find(_document->_nodes[_index], attribute) : nullptr;
    if (!found)
        return {};
    return std::string_view(_document->_text).substr(found->text, found->text_size);
}

Xml_Node Xml_Node::first() const
{
    return _document ? _document->node(_document->_nodes[_index].first_child) : Xml_Node();
}

Xml_Node Xml_Node::next() const
{
    return _document ? _document->node(_document->_nodes[_index].next) : Xml_Node();
}

Xml_Node Xml_Node::child(Xml_Tag tag) const
{
    for (const Xml_Node each : children())
        if (each.is(tag))
            return each;
    return {};
}

Xml_Node::Children Xml_Node::children() const
{
    return Children(first());
}

const Xml_Document::Attribute* Xml_Document::find(const Element& element, Xml_Attribute name) const
{
    for (std::uint32_t i = 0; i < element.attribute_count; ++i)
        if (_attributes[element.attributes + i].name == name)
            return &_attributes[element.attributes + i];
    return nullptr;
}

} // namespace KPRV::kldrcim

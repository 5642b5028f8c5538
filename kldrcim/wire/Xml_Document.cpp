#include "kldrcim/wire/Xml_Document.h"

namespace KPRV::kldrcim {

Xml_Tag Xml_Node::tag() const
{
    return document_->nodes_[index_].tag;
}

std::string_view Xml_Node::text() const
{
    if (!document_)
        return {};
    const auto& element = document_->nodes_[index_];
    return std::string_view(document_->text_).substr(element.text, element.text_size);
}

bool Xml_Node::has(Xml_Attribute attribute) const
{
    return document_ && document_->find(document_->nodes_[index_], attribute);
}

std::string_view Xml_Node::attribute(Xml_Attribute attribute) const
{
    const auto* found = document_ ? document_->find(document_->nodes_[index_], attribute) : nullptr;
    if (!found)
        return {};
    return std::string_view(document_->text_).substr(found->text, found->text_size);
}

Xml_Node Xml_Node::first() const
{
    return document_ ? document_->node(document_->nodes_[index_].first_child) : Xml_Node();
}

Xml_Node Xml_Node::next() const
{
    return document_ ? document_->node(document_->nodes_[index_].next) : Xml_Node();
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
        if (attributes_[element.attributes + i].name == name)
            return &attributes_[element.attributes + i];
    return nullptr;
}

} // namespace KPRV::kldrcim

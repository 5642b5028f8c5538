#pragma once

#include "kldrcim/wire/Xml_Names.h"

#include <deque>
#include <string>

namespace KPRV::kldrcim {

class Xml_Document;

/// An element of a document, as small as a pointer and a number. Lives as long as the document, and as the
/// element stays in it. What is asked of no element answers with nothing.
class Xml_Node
{
public:
    Xml_Node() = default;

    explicit operator bool() const { return _document != nullptr; }
    Xml_Tag tag() const;
    bool is(Xml_Tag tag) const { return _document && this->tag() == tag; }
    /// Of an element that holds text; references are resolved.
    std::string_view text() const;
    bool has(Xml_Attribute attribute) const;
    /// Empty if it is not there.
    std::string_view attribute(Xml_Attribute attribute) const;

    Xml_Node first() const;
    Xml_Node next() const;
    /// The first child of that name.
    Xml_Node child(Xml_Tag tag) const;

    /// The children, for a loop.
    class Iterator;
    class Children;
    Children children() const;

private:
    friend class Xml_Document;
    Xml_Node(const Xml_Document* document, std::uint32_t index) : _document(document), _index(index) {}

    const Xml_Document* _document = nullptr;
    std::uint32_t _index = 0;
};

/// The elements of one XML text, in a few bytes for each: a text takes several times its size, and never ten
/// times, whatever it is made of.
class Xml_Document
{
public:
    Xml_Document() = default;
    Xml_Document(const Xml_Document&) = delete;
    Xml_Document& operator=(const Xml_Document&) = delete;
    Xml_Document(Xml_Document&&) = default;
    Xml_Document& operator=(Xml_Document&&) = default;

    /// No element before the first has been read.
    Xml_Node root() const { return node(_nodes.empty() ? NONE : 0); }
    /// Bytes that it takes.
    std::size_t size() const
    {
        return _text.size() + _nodes.size() * sizeof(Element) + _attributes.size() * sizeof(Attribute);
    }

private:
    friend class Xml_Node;
    friend class Xml_Reader;

    static constexpr std::uint32_t NONE = ~std::uint32_t(0);

    struct Element
    {
        Xml_Tag tag;
        std::uint8_t attribute_count = 0;
        std::uint32_t attributes = 0;
        std::uint32_t first_child = NONE;
        std::uint32_t next = NONE;
        std::uint32_t text = 0;
        std::uint32_t text_size = 0;
    };
    struct Attribute
    {
        Xml_Attribute name;
        std::uint32_t text;
        std::uint32_t text_size;
    };

    Xml_Node node(std::uint32_t index) const { return index == NONE ? Xml_Node() : Xml_Node(this, index); }
    const Attribute* find(const Element& element, Xml_Attribute name) const;

    // In pieces: nothing is copied while they grow.
    std::deque<Element> _nodes;
    std::deque<Attribute> _attributes;
    std::string _text;
};

class Xml_Node::Iterator
{
public:
    explicit Iterator(Xml_Node node) : _node(node) {}
    Xml_Node operator*() const { return _node; }
    Iterator& operator++()
    {
        _node = _node.next();
        return *this;
    }
    bool operator!=(const Iterator& other) const { return bool(_node) != bool(other._node); }

private:
    Xml_Node _node;
};

class Xml_Node::Children
{
public:
    explicit Children(Xml_Node first) : _first(first) {}
    Iterator begin() const { return Iterator(_first); }
    static Iterator end() { return Iterator(Xml_Node()); }

private:
    Xml_Node _first;
};

} // namespace KPRV::kldrcim

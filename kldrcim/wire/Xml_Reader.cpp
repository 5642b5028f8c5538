#include "kldrcim/wire/Xml_Reader.h"

#include "broker/values/Control_Text.h"

#include <expat.h>

#include <algorithm>
#include <new>
#include <utility>

namespace KPRV::kldrcim {

namespace {

/// Of a tag or comment; expat looks at one from its beginning each time that a piece is added.
constexpr std::size_t LONGEST_TOKEN = std::size_t(1) << 20;
/// Positions in a document have 32 bits.
constexpr std::size_t MOST_BYTES = std::size_t(1) << 30;

bool is_blank(std::string_view text)
{
    return text.find_first_not_of(" \t\r\n") == std::string_view::npos;
}

bool has_control(std::string_view text)
{
    for (; !text.empty(); text.remove_prefix(1))
        if (broker::control_size(text) != 0)
            return true;
    return false;
}

} // namespace

/// What expat calls. It is C: nothing is thrown through it.
struct Xml_Reader::Events
{
    template <class Step>
    static void guarded(void* data, Step step)
    {
        Xml_Reader& reader = *static_cast<Xml_Reader*>(data);
        if (reader._fault != Xml_Fault::NONE || reader._thrown)
            return;
        try {
            step(reader);
        } catch (...) {
            reader._thrown = std::current_exception();
            XML_StopParser(reader._parser.get(), XML_FALSE);
        }
    }

    static void start(void* data, const char* name, const char** attributes)
    {
        guarded(data, [&](Xml_Reader& reader) { reader.start(name, attributes); });
    }
    static void end(void* data, const char*)
    {
        guarded(data, [](Xml_Reader& reader) { reader.end(); });
    }
    static void characters(void* data, const char* text, int size)
    {
        guarded(data, [&](Xml_Reader& reader) { reader.characters({text, static_cast<std::size_t>(size)}); });
    }
    static void document_type(void* data, const char*, const char*, const char*, int)
    {
        guarded(data, [](Xml_Reader& reader) {
            reader.stop(Xml_Fault::NOT_WELL_FORMED, "a document type is not accepted");
        });
    }
};

void Xml_Reader::Free_Parser::operator()(XML_ParserStruct* parser) const
{
    XML_ParserFree(parser);
}

Xml_Reader::Xml_Reader(const Xml_Limits& limits, Receiver receiver)
    : _limits(limits), _receiver(std::move(receiver)), _parser(XML_ParserCreate("UTF-8"))
{
    if (!_parser)
        throw std::bad_alloc();
    _limits.bytes = std::min(_limits.bytes, MOST_BYTES);
    XML_SetUserData(_parser.get(), this);
    XML_SetElementHandler(_parser.get(), Events::start, Events::end);
    XML_SetCharacterDataHandler(_parser.get(), Events::characters);
    XML_SetStartDoctypeDeclHandler(_parser.get(), Events::document_type);
}

Xml_Reader::~Xml_Reader() = default;

bool Xml_Reader::feed(std::string_view piece)
{
    // The mark of UTF-16, which expat would take.
    if (_bytes == 0 && !piece.empty() && static_cast<unsigned char>(piece[0]) >= 0xFE)
        stop(Xml_Fault::NOT_WELL_FORMED, "not in UTF-8");
    _bytes += piece.size();
    // What has been handed over is gone.
    const std::size_t kept = _receiver ? _document.size() : _bytes;
    if (_fault == Xml_Fault::NONE && kept > _limits.bytes)
        stop(Xml_Fault::TOO_LARGE, "longer than " + std::to_string(_limits.bytes) + " bytes");
    // An int counts what expat takes at a time.
    while (_fault == Xml_Fault::NONE && piece.size() > LONGEST_TOKEN) {
        parse(piece.substr(0, LONGEST_TOKEN), false);
        piece.remove_prefix(LONGEST_TOKEN);
    }
    return _fault == Xml_Fault::NONE && parse(piece, false);
}

bool Xml_Reader::finish()
{
    return _fault == Xml_Fault::NONE && parse({}, true);
}

bool Xml_Reader::parse(std::string_view piece, bool last)
{
    XML_Parser parser = _parser.get();
    const XML_Status status = XML_Parse(parser, piece.data(), static_cast<int>(piece.size()), last);
    if (_thrown)
        std::rethrow_exception(std::exchange(_thrown, nullptr));
    if (_fault == Xml_Fault::NONE && status != XML_STATUS_OK) {
        if (XML_GetErrorCode(parser) == XML_ERROR_NO_MEMORY)
            throw std::bad_alloc();
        stop(Xml_Fault::NOT_WELL_FORMED, XML_ErrorString(XML_GetErrorCode(parser)));
    }
    const auto at = static_cast<std::size_t>(std::max<XML_Index>(XML_GetCurrentByteIndex(parser), 0));
    if (_fault == Xml_Fault::NONE && !last && _bytes - std::min(at, _bytes) > 2 * LONGEST_TOKEN)
        stop(Xml_Fault::TOO_LARGE, "a tag or comment without end");
    return _fault == Xml_Fault::NONE;
}

void Xml_Reader::stop(Xml_Fault fault, const std::string& text)
{
    XML_Parser parser = _parser.get();
    _fault = fault;
    _fault_text = "line " + std::to_string(XML_GetCurrentLineNumber(parser)) + ", column " +
                  std::to_string(XML_GetCurrentColumnNumber(parser) + 1) + ": " + text;
    XML_StopParser(parser, XML_FALSE);
}

std::uint32_t Xml_Reader::keep(std::string_view text)
{
    const auto at = static_cast<std::uint32_t>(_document._text.size());
    _document._text.append(text);
    return at;
}

void Xml_Reader::start(const char* name, const char** attributes)
{
    if (_open.size() >= _limits.depth)
        return stop(Xml_Fault::TOO_LARGE, "more than " + std::to_string(_limits.depth) + " elements deep");
    const std::optional<Xml_Tag> tag = tag_of(name);
    auto& nodes = _document._nodes;
    if (!tag || (!_open.empty() && !may_hold(nodes[_open.back().index].tag, *tag)))
        return stop(Xml_Fault::NOT_VALID,
                    "no element <" + std::string(name).substr(0, 64) + "> " +
                        (_open.empty() ? std::string("known")
                                       : "in <" + std::string(name_of(nodes[_open.back().index].tag)) + ">"));
    const auto index = static_cast<std::uint32_t>(nodes.size());
    auto& element = nodes.emplace_back(Xml_Document::Element{.tag = *tag});
    element.attributes = static_cast<std::uint32_t>(_document._attributes.size());
    unsigned count = 0;
    for (; *attributes; attributes += 2) {
        if (++count > _limits.attributes)
            return stop(Xml_Fault::TOO_LARGE, "too many attributes");
        if (const auto known = attribute_of(attributes[0])) {
            const std::string_view value = attributes[1];
            if (known != Xml_Attribute::DESCRIPTION && has_control(value))
                return stop(Xml_Fault::NOT_VALID, "a control character in a name");
            _document._attributes.push_back({*known, keep(value), static_cast<std::uint32_t>(value.size())});
            ++element.attribute_count;
        }
    }
    element.text = static_cast<std::uint32_t>(_document._text.size());
    if (!_open.empty()) {
        Open_Element& parent = _open.back();
        (parent.latest_child == Xml_Document::NONE ? nodes[parent.index].first_child
                                                   : nodes[parent.latest_child].next) = index;
        parent.latest_child = index;
    }
    _open.push_back({index, Xml_Document::NONE});
}

void Xml_Reader::end()
{
    const std::uint32_t index = _open.back().index;
    _open.pop_back();
    if (_receiver && !_open.empty() && _document._nodes[_open.back().index].tag == Xml_Tag::IRETURNVALUE)
        hand_over(index);
}

void Xml_Reader::hand_over(std::uint32_t index)
{
    _receiver(_document.node(index));
    const Xml_Document::Element& element = _document._nodes[index];
    const std::uint32_t attributes = element.attributes;
    const std::uint32_t text =
        element.attribute_count == 0 ? element.text : _document._attributes[attributes].text;
    _document._text.resize(text);
    _document._attributes.resize(attributes, Xml_Document::Attribute{});
    _document._nodes.erase(_document._nodes.begin() + index, _document._nodes.end());
    Open_Element& parent = _open.back();
    _document._nodes[parent.index].first_child = Xml_Document::NONE;
    parent.latest_child = Xml_Document::NONE;
}

void Xml_Reader::characters(std::string_view text)
{
    auto& element = _document._nodes[_open.back().index];
    if (holds_text(element.tag)) {
        keep(text);
        element.text_size += static_cast<std::uint32_t>(text.size());
    } else if (!is_blank(text)) {
        stop(Xml_Fault::NOT_VALID, "text in <" + std::string(name_of(element.tag)) + ">");
    }
}

} // namespace KPRV::kldrcim

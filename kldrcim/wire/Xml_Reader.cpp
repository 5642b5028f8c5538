#include "kldrcim/wire/Xml_Reader.h"

#include <expat.h>

#include <algorithm>
#include <new>
#include <utility>

namespace KPRV::kldrcim {

namespace {

/// Of a tag or comment; expat looks at one from its beginning each time that a piece is added.
constexpr std::size_t longest_token = std::size_t(1) << 20;
/// Positions in a document have 32 bits.
constexpr std::size_t most_bytes = std::size_t(1) << 30;

bool is_blank(std::string_view text)
{
    return text.find_first_not_of(" \t\r\n") == std::string_view::npos;
}

} // namespace

/// What expat calls. It is C: nothing is thrown through it.
struct Xml_Reader::Events
{
    template <class Step>
    static void guarded(void* data, Step step)
    {
        Xml_Reader& reader = *static_cast<Xml_Reader*>(data);
        if (reader.fault_ != Xml_Fault::NONE || reader.thrown_)
            return;
        try {
            step(reader);
        } catch (...) {
            reader.thrown_ = std::current_exception();
            XML_StopParser(reader.parser_.get(), XML_FALSE);
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
    : limits_(limits), receiver_(std::move(receiver)), parser_(XML_ParserCreate("UTF-8"))
{
    if (!parser_)
        throw std::bad_alloc();
    limits_.bytes = std::min(limits_.bytes, most_bytes);
    XML_SetUserData(parser_.get(), this);
    XML_SetElementHandler(parser_.get(), Events::start, Events::end);
    XML_SetCharacterDataHandler(parser_.get(), Events::characters);
    XML_SetStartDoctypeDeclHandler(parser_.get(), Events::document_type);
}

Xml_Reader::~Xml_Reader() = default;

bool Xml_Reader::feed(std::string_view piece)
{
    // The mark of UTF-16, which expat would take.
    if (bytes_ == 0 && !piece.empty() && static_cast<unsigned char>(piece[0]) >= 0xFE)
        stop(Xml_Fault::NOT_WELL_FORMED, "not in UTF-8");
    bytes_ += piece.size();
    // What has been handed over is gone.
    const std::size_t kept = receiver_ ? document_.size() : bytes_;
    if (fault_ == Xml_Fault::NONE && kept > limits_.bytes)
        stop(Xml_Fault::TOO_LARGE, "longer than " + std::to_string(limits_.bytes) + " bytes");
    // An int counts what expat takes at a time.
    while (fault_ == Xml_Fault::NONE && piece.size() > longest_token) {
        parse(piece.substr(0, longest_token), false);
        piece.remove_prefix(longest_token);
    }
    return fault_ == Xml_Fault::NONE && parse(piece, false);
}

bool Xml_Reader::finish()
{
    return fault_ == Xml_Fault::NONE && parse({}, true);
}

bool Xml_Reader::parse(std::string_view piece, bool last)
{
    XML_Parser parser = parser_.get();
    const XML_Status status = XML_Parse(parser, piece.data(), static_cast<int>(piece.size()), last);
    if (thrown_)
        std::rethrow_exception(std::exchange(thrown_, nullptr));
    if (fault_ == Xml_Fault::NONE && status != XML_STATUS_OK) {
        if (XML_GetErrorCode(parser) == XML_ERROR_NO_MEMORY)
            throw std::bad_alloc();
        stop(Xml_Fault::NOT_WELL_FORMED, XML_ErrorString(XML_GetErrorCode(parser)));
    }
    const auto at = static_cast<std::size_t>(std::max<XML_Index>(XML_GetCurrentByteIndex(parser), 0));
    if (fault_ == Xml_Fault::NONE && !last && bytes_ - std::min(at, bytes_) > 2 * longest_token)
        stop(Xml_Fault::TOO_LARGE, "a tag or comment without end");
    return fault_ == Xml_Fault::NONE;
}

void Xml_Reader::stop(Xml_Fault fault, const std::string& text)
{
    XML_Parser parser = parser_.get();
    fault_ = fault;
    fault_text_ = "line " + std::to_string(XML_GetCurrentLineNumber(parser)) + ", column " +
                  std::to_string(XML_GetCurrentColumnNumber(parser) + 1) + ": " + text;
    XML_StopParser(parser, XML_FALSE);
}

std::uint32_t Xml_Reader::keep(std::string_view text)
{
    const auto at = static_cast<std::uint32_t>(document_.text_.size());
    document_.text_.append(text);
    return at;
}

void Xml_Reader::start(const char* name, const char** attributes)
{
    if (open_.size() >= limits_.depth)
        return stop(Xml_Fault::TOO_LARGE, "more than " + std::to_string(limits_.depth) + " elements deep");
    const std::optional<Xml_Tag> tag = tag_of(name);
    auto& nodes = document_.nodes_;
    if (!tag || (!open_.empty() && !may_hold(nodes[open_.back().index].tag, *tag)))
        return stop(Xml_Fault::NOT_VALID,
                    "no element <" + std::string(name).substr(0, 64) + "> " +
                        (open_.empty() ? std::string("known")
                                       : "in <" + std::string(name_of(nodes[open_.back().index].tag)) + ">"));
    const auto index = static_cast<std::uint32_t>(nodes.size());
    auto& element = nodes.emplace_back(Xml_Document::Element{.tag = *tag});
    element.attributes = static_cast<std::uint32_t>(document_.attributes_.size());
    unsigned count = 0;
    for (; *attributes; attributes += 2) {
        if (++count > limits_.attributes)
            return stop(Xml_Fault::TOO_LARGE, "too many attributes");
        if (const auto known = attribute_of(attributes[0])) {
            const std::string_view value = attributes[1];
            document_.attributes_.push_back({*known, keep(value), static_cast<std::uint32_t>(value.size())});
            ++element.attribute_count;
        }
    }
    element.text = static_cast<std::uint32_t>(document_.text_.size());
    if (!open_.empty()) {
        Open_Element& parent = open_.back();
        (parent.latest_child == Xml_Document::none ? nodes[parent.index].first_child
                                                   : nodes[parent.latest_child].next) = index;
        parent.latest_child = index;
    }
    open_.push_back({index, Xml_Document::none});
}

void Xml_Reader::end()
{
    const std::uint32_t index = open_.back().index;
    open_.pop_back();
    if (receiver_ && !open_.empty() && document_.nodes_[open_.back().index].tag == Xml_Tag::IRETURNVALUE)
        hand_over(index);
}

void Xml_Reader::hand_over(std::uint32_t index)
{
    receiver_(document_.node(index));
    const Xml_Document::Element& element = document_.nodes_[index];
    const std::uint32_t attributes = element.attributes;
    const std::uint32_t text =
        element.attribute_count == 0 ? element.text : document_.attributes_[attributes].text;
    document_.text_.resize(text);
    document_.attributes_.resize(attributes, Xml_Document::Attribute{});
    document_.nodes_.erase(document_.nodes_.begin() + index, document_.nodes_.end());
    Open_Element& parent = open_.back();
    document_.nodes_[parent.index].first_child = Xml_Document::none;
    parent.latest_child = Xml_Document::none;
}

void Xml_Reader::characters(std::string_view text)
{
    auto& element = document_.nodes_[open_.back().index];
    if (holds_text(element.tag)) {
        keep(text);
        element.text_size += static_cast<std::uint32_t>(text.size());
    } else if (!is_blank(text)) {
        stop(Xml_Fault::NOT_VALID, "text in <" + std::string(name_of(element.tag)) + ">");
    }
}

} // namespace KPRV::kldrcim

#pragma once

#include "kldrcim/wire/Xml_Document.h"

#include <functional>
#include <memory>
#include <vector>

struct XML_ParserStruct;

namespace KPRV::kldrcim {

/// What a text may ask of its reader.
struct Xml_Limits
{
    std::size_t bytes = std::size_t(16) << 20;
    /// The messages need twelve.
    unsigned depth = 64;
    unsigned attributes = 32;
};

enum class Xml_Fault
{
    NONE,
    /// No XML in UTF-8, or with a document type: who declares nothing needs no entities.
    NOT_WELL_FORMED,
    /// XML, but not of CIM: an element that there is not, or not here.
    NOT_VALID,
    /// Beyond a limit.
    TOO_LARGE,
};

/// Makes a document of an XML text that may come in pieces, and of any text without harm.
///
///     Xml_Reader reader;
///     while (...)
///         if (!reader.feed(piece))
///             return refuse(reader.fault());
///     if (reader.finish())
///         answer(reader.document());
class Xml_Reader
{
public:
    /// Gets each child of an IRETURNVALUE as soon as it has been read, and nobody later: it is gone from the
    /// document when this returns. So an answer of any length takes no more than its largest object. What it
    /// throws comes out of `feed`.
    using Receiver = std::function<void(Xml_Node)>;

    explicit Xml_Reader(const Xml_Limits& limits = {}, Receiver receiver = {});
    ~Xml_Reader();
    Xml_Reader(const Xml_Reader&) = delete;
    Xml_Reader& operator=(const Xml_Reader&) = delete;

    /// False once there is a fault; what comes later is ignored.
    bool feed(std::string_view piece);
    /// At the end of the text; false if it has a fault or is not complete.
    bool finish();

    Xml_Fault fault() const { return _fault; }
    /// "line 3, column 7: no element <X> in <Y>"; empty without a fault.
    const std::string& fault_text() const { return _fault_text; }

    const Xml_Document& document() const { return _document; }
    /// Takes the document out of the reader.
    Xml_Document take() { return std::move(_document); }

private:
    struct Events;
    struct Free_Parser
    {
        void operator()(XML_ParserStruct* parser) const;
    };
    /// An element that is not yet at its end, its latest child, and where all that it has brought begins.
    struct Open_Element
    {
        std::uint32_t index;
        std::uint32_t latest_child;
    };

    bool parse(std::string_view piece, bool last);
    void stop(Xml_Fault fault, const std::string& text);
    void start(const char* name, const char** attributes);
    void end();
    void characters(std::string_view text);
    std::uint32_t keep(std::string_view text);
    void hand_over(std::uint32_t index);

    Xml_Limits _limits;
    Receiver _receiver;
    std::unique_ptr<XML_ParserStruct, Free_Parser> _parser;
    Xml_Document _document;
    std::vector<Open_Element> _open;
    std::size_t _bytes = 0;
    Xml_Fault _fault = Xml_Fault::NONE;
    std::string _fault_text;
    std::exception_ptr _thrown;
};

} // namespace KPRV::kldrcim

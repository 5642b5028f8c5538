#pragma once

#include "broker/values/Receiver.h"
#include "kldrcim/server/Cim_Call.h"
#include "kldrcim/wire/Instance_Writing.h"

namespace KPRV::kldrcim {

/// Where a long answer goes while it is still being made.
class Body_Sink
{
public:
    virtual ~Body_Sink() = default;
    /// Takes the text away. False if nobody reads any more.
    virtual bool send(std::string&& text) = 0;
    /// Takes the status of an operation that failed when a part of its answer had been sent, for a place
    /// behind the text. False if there is no such place.
    virtual bool take_status(CMPIrc, const std::string&) { return false; }
};

/// The message that answers a message, written as its parts come, one call after the other. The text is sent
/// in pieces once it has grown long; until then an error replaces all that has been written of a call.
class Answer
{
public:
    Answer(const Cim_Message& message, Body_Sink& sink);

    /// In front of all that answers a call.
    void begin(const Cim_Call& call);

    /// In front of each object of IRETURNVALUE.
    Xml_Writer& object();
    /// Behind each; false if nobody reads any more.
    bool object_done();
    /// IRETURNVALUE, also if there is no object. Operations that give nothing back have none.
    void open_values();

    /// In front of what follows the objects: RETURNVALUE of a method, and parameters.
    Xml_Writer& behind_values();

    /// The end of what answers a call, without error.
    void succeed();
    /// True if a part has been sent and nothing can be said behind it: then the text has no end, and the
    /// connection must be cut.
    bool fail(CMPIrc rc, const std::string& text);

    /// The end of the message.
    void end();

    /// True once a piece has been sent that nobody took.
    bool is_unread() const { return _unread; }

    /// What has not been sent.
    std::string take_rest() { return std::move(_text); }

private:
    void open_response();
    /// False if nobody reads any more.
    bool send_if_long();

    const Cim_Message& _message;
    const Cim_Call* _call = nullptr;
    Body_Sink& _sink;
    std::string _text;
    Xml_Writer _writer;
    /// Where in the text the answer to the call begins, unless a part of it has been sent.
    std::size_t _from = 0;
    /// Where the last object ends.
    std::size_t _whole = 0;
    bool _in_values = false;
    bool _sent = false;
    bool _unread = false;
};

/// "CIM_ERR_NOT_FOUND" of what a client is told: the codes beyond those of clients become 1.
CMPIrc wire_status(CMPIrc rc);

} // namespace KPRV::kldrcim

#include "kldrcim/server/Answer.h"

#include "broker/values/Type_Words.h"

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;
using At = Xml_Attribute;

/// What is sent at a time.
constexpr std::size_t PIECE_SIZE = std::size_t(64) << 10;
constexpr int LAST_STATUS = 29;

} // namespace

CMPIrc wire_status(CMPIrc rc)
{
    constexpr int NO_MORE_ELEMENTS = 18, no_response = 19;
    const bool known = rc > 0 && rc <= LAST_STATUS && rc != NO_MORE_ELEMENTS && rc != no_response;
    return known ? rc : CMPIrc(CMPI_RC_ERR_FAILED);
}

Answer::Answer(const Cim_Message& message, Body_Sink& sink) : _message(message), _sink(sink), _writer(_text)
{
    _text += xml_declaration;
    _writer.open(Tag::CIM).attribute(At::CIMVERSION, "2.0").attribute(At::DTDVERSION, "2.0");
    _writer.open(Tag::MESSAGE).attribute(At::ID, _message.id).attribute(At::PROTOCOLVERSION, "1.0");
    if (_message.is_multiple)
        _writer.open(Tag::MULTIRSP);
    // The end of the tag belongs to what stands before a call.
    _writer.text({});
}

void Answer::begin(const Cim_Call& call)
{
    _call = &call;
    _from = _text.size();
    _in_values = _sent = false;
    open_response();
}

void Answer::open_response()
{
    _writer.open(Tag::SIMPLERSP);
    _writer.open(_call->is_extrinsic ? Tag::METHODRESPONSE : Tag::IMETHODRESPONSE)
        .attribute(At::NAME, _call->name);
}

void Answer::open_values()
{
    if (!_in_values)
        _writer.open(Tag::IRETURNVALUE);
    _in_values = true;
}

Xml_Writer& Answer::object()
{
    open_values();
    return _writer;
}

bool Answer::object_done()
{
    _writer.text("\n");
    _sent = _sent || _text.size() >= PIECE_SIZE;
    const bool is_read = send_if_long();
    _whole = _text.size();
    return is_read;
}

bool Answer::send_if_long()
{
    if (_text.size() < PIECE_SIZE)
        return true;
    _unread = !_sink.send(std::move(_text));
    _text.clear();
    return !_unread;
}

Xml_Writer& Answer::behind_values()
{
    if (_in_values)
        _writer.close(Tag::IRETURNVALUE);
    _in_values = false;
    return _writer;
}

void Answer::succeed()
{
    behind_values()
        .close(_call->is_extrinsic ? Tag::METHODRESPONSE : Tag::IMETHODRESPONSE)
        .close(Tag::SIMPLERSP);
    if (_message.is_multiple)
        send_if_long();
}

bool Answer::fail(CMPIrc rc, const std::string& text)
{
    const CMPIrc status = wire_status(rc);
    std::string description = text.empty() ? status_name(rc) : text;
    if (status != rc && !text.empty())
        description = std::string(status_name(rc)) + ": " + text;
    // A tag that is not at its end would go on in the new text.
    _writer.text({});
    if (_sent) {
        if (_message.is_multiple || !_sink.take_status(status, description))
            return true;
        _text.erase(_whole);
        succeed();
        return false;
    }
    _text.erase(_from);
    _in_values = false;
    open_response();
    _writer.open(Tag::ERROR)
        .attribute(At::CODE, std::to_string(status))
        .attribute(At::DESCRIPTION, description)
        .close(Tag::ERROR);
    succeed();
    return false;
}

void Answer::end()
{
    if (_message.is_multiple)
        _writer.close(Tag::MULTIRSP);
    _writer.close(Tag::MESSAGE).close(Tag::CIM);
    _text += '\n';
}

} // namespace KPRV::kldrcim

#include "kldrcim/server/Answer.h"

#include "broker/values/Type_Words.h"

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;
using At = Xml_Attribute;

/// What is sent at a time.
constexpr std::size_t piece_size = std::size_t(64) << 10;
constexpr int last_status = 29;

} // namespace

CMPIrc wire_status(CMPIrc rc)
{
    constexpr int no_more_elements = 18, no_response = 19;
    const bool known = rc > 0 && rc <= last_status && rc != no_more_elements && rc != no_response;
    return known ? rc : CMPIrc(CMPI_RC_ERR_FAILED);
}

Answer::Answer(const Cim_Message& message, Body_Sink& sink) : message_(message), sink_(sink), writer_(text_)
{
    text_ += xml_declaration;
    writer_.open(Tag::CIM).attribute(At::CIMVERSION, "2.0").attribute(At::DTDVERSION, "2.0");
    writer_.open(Tag::MESSAGE).attribute(At::ID, message_.id).attribute(At::PROTOCOLVERSION, "1.0");
    if (message_.is_multiple)
        writer_.open(Tag::MULTIRSP);
    // The end of the tag belongs to what stands before a call.
    writer_.text({});
}

void Answer::begin(const Cim_Call& call)
{
    call_ = &call;
    from_ = text_.size();
    in_values_ = sent_ = false;
    open_response();
}

void Answer::open_response()
{
    writer_.open(Tag::SIMPLERSP);
    writer_.open(call_->is_extrinsic ? Tag::METHODRESPONSE : Tag::IMETHODRESPONSE)
        .attribute(At::NAME, call_->name);
}

void Answer::open_values()
{
    if (!in_values_)
        writer_.open(Tag::IRETURNVALUE);
    in_values_ = true;
}

Xml_Writer& Answer::object()
{
    open_values();
    return writer_;
}

bool Answer::object_done()
{
    writer_.text("\n");
    sent_ = sent_ || text_.size() >= piece_size;
    return send_if_long();
}

bool Answer::send_if_long()
{
    if (text_.size() < piece_size)
        return true;
    unread_ = !sink_.send(std::move(text_));
    text_.clear();
    return !unread_;
}

Xml_Writer& Answer::behind_values()
{
    if (in_values_)
        writer_.close(Tag::IRETURNVALUE);
    in_values_ = false;
    return writer_;
}

void Answer::succeed()
{
    behind_values()
        .close(call_->is_extrinsic ? Tag::METHODRESPONSE : Tag::IMETHODRESPONSE)
        .close(Tag::SIMPLERSP);
    if (message_.is_multiple)
        send_if_long();
}

bool Answer::fail(CMPIrc rc, const std::string& text)
{
    if (sent_)
        return true;
    // A tag that is not at its end would go on in the new text.
    writer_.text({});
    text_.erase(from_);
    in_values_ = false;
    open_response();
    const CMPIrc status = wire_status(rc);
    std::string description = text.empty() ? status_name(rc) : text;
    if (status != rc && !text.empty())
        description = std::string(status_name(rc)) + ": " + text;
    writer_.open(Tag::ERROR)
        .attribute(At::CODE, std::to_string(status))
        .attribute(At::DESCRIPTION, description)
        .close(Tag::ERROR);
    succeed();
    return false;
}

void Answer::end()
{
    if (message_.is_multiple)
        writer_.close(Tag::MULTIRSP);
    writer_.close(Tag::MESSAGE).close(Tag::CIM);
    text_ += '\n';
}

} // namespace KPRV::kldrcim

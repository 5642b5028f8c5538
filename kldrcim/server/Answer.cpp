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

Answer::Answer(const Cim_Call& call, Body_Sink& sink) : call_(call), sink_(sink), writer_(text_) {}

void Answer::begin()
{
    if (begun_)
        return;
    begun_ = true;
    text_ += xml_declaration;
    writer_.open(Tag::CIM).attribute(At::CIMVERSION, "2.0").attribute(At::DTDVERSION, "2.0");
    writer_.open(Tag::MESSAGE).attribute(At::ID, call_.id).attribute(At::PROTOCOLVERSION, "1.0");
    writer_.open(Tag::SIMPLERSP);
    writer_.open(call_.is_extrinsic ? Tag::METHODRESPONSE : Tag::IMETHODRESPONSE)
        .attribute(At::NAME, call_.name);
}

void Answer::open_values()
{
    begin();
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
    if (text_.size() < piece_size)
        return true;
    sent_ = true;
    const bool read = sink_.send(std::move(text_));
    text_.clear();
    return read;
}

Xml_Writer& Answer::behind_values()
{
    begin();
    if (in_values_)
        writer_.close(Tag::IRETURNVALUE);
    in_values_ = false;
    return writer_;
}

void Answer::succeed()
{
    behind_values()
        .close(call_.is_extrinsic ? Tag::METHODRESPONSE : Tag::IMETHODRESPONSE)
        .close(Tag::SIMPLERSP)
        .close(Tag::MESSAGE)
        .close(Tag::CIM);
    text_ += '\n';
}

bool Answer::fail(CMPIrc rc, const std::string& text)
{
    if (sent_)
        return true;
    // A tag that is not at its end would go on in the new text.
    writer_.text({});
    text_.clear();
    begun_ = in_values_ = false;
    begin();
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

} // namespace KPRV::kldrcim

#include "kldrcim/server/Cim_Call.h"

#include "kldrcim/wire/Instance_Reading.h"
#include "kldrcim/wire/Wire_Text.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;
using At = Xml_Attribute;

/// No class has so many properties.
constexpr std::size_t MOST_NAMES = 1000;
/// Of one message.
constexpr std::size_t MOST_CALLS = 1000;

[[noreturn]] void refuse_message(const std::string& text)
{
    throw Http_Refusal{400, "request-not-valid", text};
}

/// "2.0" for a major number of 2; an absent version is refused as any other.
void check_version(std::string_view version, std::string_view major, const char* error)
{
    if (version.substr(0, version.find('.')) != major)
        throw Http_Refusal{501, error, "no version \"" + std::string(version.substr(0, 32)) + "\""};
}

Xml_Node only_child(Xml_Node node, const char* what)
{
    if (!node.first() || node.first().next())
        refuse_message(std::string("a message has one ") + what);
    return node.first();
}

Xml_Node call_of(Xml_Node request)
{
    Xml_Node call;
    for (const Xml_Node each : request.children())
        if (!each.is(Tag::CORRELATOR)) {
            if (call)
                refuse_message("a request has one call");
            call = each;
        }
    if (!call)
        refuse_message("a request without a call");
    return call;
}

int hex_digit(char c)
{
    if (c >= '0' && c <= '9')
        return c - '0';
    const char lower = static_cast<char>(c | 0x20);
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

std::string percent_decoded(std::string_view text)
{
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const int high = text[i] == '%' && i + 2 < text.size() ? hex_digit(text[i + 1]) : -1;
        const int low = high >= 0 ? hex_digit(text[i + 2]) : -1;
        if (low >= 0)
            i += 2;
        result += low >= 0 ? static_cast<char>(high * 16 + low) : text[i];
    }
    return result;
}

std::string_view without_slashes(std::string_view text)
{
    while (text.starts_with('/'))
        text.remove_prefix(1);
    while (text.ends_with('/'))
        text.remove_suffix(1);
    return text;
}

/// Of a method: "root/kaldera:Class.Key=..."; the keys can be written in too many ways to be compared.
bool names_object(std::string_view header, const Cim_Call& call)
{
    const std::size_t colon = call.is_extrinsic ? header.find(':') : header.npos;
    if (!same_name(without_slashes(header.substr(0, colon)), call.name_space))
        return false;
    if (!call.is_extrinsic || colon == header.npos)
        return !call.is_extrinsic;
    const std::string_view object = header.substr(colon + 1);
    const Xml_Node inner = call.object.first().next();
    return same_name(object.substr(0, object.find('.')),
                     inner.attribute(inner.is(Tag::CLASSNAME) ? At::NAME : At::CLASSNAME));
}

} // namespace

namespace {

Cim_Call read_call(Xml_Node request)
{
    if (!request.is(Tag::SIMPLEREQ))
        throw Http_Refusal{400, "unsupported-operation", "no request of an operation"};
    Cim_Call call;
    call.element = call_of(request);
    call.is_extrinsic = call.element.is(Tag::METHODCALL);
    call.name = call.element.attribute(At::NAME);
    const Xml_Node place = call.element.first();
    const bool placed = call.is_extrinsic ? place.is(Tag::LOCALINSTANCEPATH) || place.is(Tag::LOCALCLASSPATH)
                                          : place.is(Tag::LOCALNAMESPACEPATH);
    if (call.name.empty() || !placed)
        refuse_message("a call without name or place");
    try {
        const No_Catalogue no_classes;
        call.object = call.is_extrinsic ? place : Xml_Node();
        call.name_space = call.is_extrinsic ? Instance_Reader(no_classes).path(place).name_space
                                            : Instance_Reader::name_space(place);
    } catch (const Wire_Error& error) {
        refuse_message(error.what());
    }
    return call;
}

} // namespace

Cim_Message read_message(const Xml_Document& document)
{
    const Xml_Node root = document.root();
    if (!root.is(Tag::CIM))
        refuse_message("no <CIM>");
    check_version(root.attribute(At::CIMVERSION), "2", "unsupported-cim-version");
    check_version(root.attribute(At::DTDVERSION), "2", "unsupported-dtd-version");
    const Xml_Node element = only_child(root, "<MESSAGE>");
    if (!element.has(At::ID))
        refuse_message("<MESSAGE> without ID");
    check_version(element.attribute(At::PROTOCOLVERSION), "1", "unsupported-protocol-version");
    const Xml_Node request = only_child(element, "request");
    Cim_Message message;
    message.id = element.attribute(At::ID);
    message.is_multiple = request.is(Tag::MULTIREQ);
    if (!message.is_multiple) {
        message.calls.push_back(read_call(request));
        return message;
    }
    for (const Xml_Node each : request.children()) {
        if (message.calls.size() == MOST_CALLS)
            throw Http_Refusal{413, nullptr, "more than " + std::to_string(MOST_CALLS) + " requests"};
        message.calls.push_back(read_call(each));
    }
    // Some clients send one as they would send many.
    if (message.calls.empty())
        refuse_message("<MULTIREQ> without a request");
    return message;
}

void check_headers(const Cim_Headers& headers, const Cim_Message& message)
{
    if (headers.operation && !same_name(headers.operation, "MethodCall"))
        throw Http_Refusal{400, "unsupported-operation", "CIMOperation is not MethodCall"};
    if (headers.protocol_version)
        check_version(headers.protocol_version, "1", "unsupported-protocol-version");
    if (message.is_multiple ? headers.method || headers.object : headers.batch != nullptr)
        throw Http_Refusal{400, "header-mismatch",
                           "CIMBatch is for messages with several requests, CIMMethod and CIMObject for one"};
    if (message.is_multiple)
        return;
    const Cim_Call& call = message.calls.front();
    if (headers.method && !same_name(percent_decoded(headers.method), call.name))
        throw Http_Refusal{400, "header-mismatch", "CIMMethod names another method than the message"};
    if (headers.object && !names_object(percent_decoded(headers.object), call))
        throw Http_Refusal{400, "header-mismatch", "CIMObject names another object than the message"};
}

Parameters::Parameters(const Cim_Call& call, std::string_view known)
{
    for (const Xml_Node each : call.element.children()) {
        if (!each.is(Tag::IPARAMVALUE))
            continue;
        const std::string_view name = each.attribute(At::NAME);
        bool is_known = false;
        for (std::string_view rest = known; !rest.empty() && !is_known;) {
            const std::string_view word = rest.substr(0, rest.find(' '));
            is_known = same_name(word, name);
            rest.remove_prefix(std::min(rest.size(), word.size() + 1));
        }
        if (!is_known)
            throw Wire_Error::status(CMPI_RC_ERR_NOT_SUPPORTED,
                                     call.name + " has no parameter " + std::string(name.substr(0, 64)));
        if (std::ranges::any_of(_values, [&](const auto& value) { return same_name(value.first, name); }))
            throw Wire_Error::status(CMPI_RC_ERR_INVALID_PARAMETER, std::string(name) + " is there twice");
        _values.emplace_back(name, each.first());
    }
}

Xml_Node Parameters::find(std::string_view name) const
{
    for (const auto& [each, node] : _values)
        if (same_name(each, name))
            return node;
    return {};
}

Xml_Node Parameters::required(std::string_view name) const
{
    const Xml_Node node = find(name);
    if (!node)
        throw Wire_Error::status(CMPI_RC_ERR_INVALID_PARAMETER, std::string(name) + " is missing");
    return node;
}

namespace {

/// A value that is none of its type is a wrong parameter here.
Plain_Value parameter_value(Xml_Node node, std::string_view name, CMPIType type)
{
    try {
        if (node.is(Tag::VALUE))
            return value_of_wire_text(node.text(), type);
    } catch (const Wire_Error&) {
        // Said below, with the name.
    }
    throw Wire_Error::status(CMPI_RC_ERR_INVALID_PARAMETER,
                             std::string(name) + " is no " + wire_type_name(type));
}

} // namespace

bool Parameters::flag(std::string_view name, bool otherwise) const
{
    const Xml_Node node = find(name);
    return node ? parameter_value(node, name, CMPI_boolean).as_bool() : otherwise;
}

std::optional<std::uint64_t> Parameters::number(std::string_view name) const
{
    const Xml_Node node = find(name);
    if (!node)
        return std::nullopt;
    return parameter_value(node, name, CMPI_uint32).as_uint();
}

std::string Parameters::text(std::string_view name) const
{
    const Xml_Node node = find(name);
    return node ? parameter_value(node, name, CMPI_string).as_text() : std::string();
}

std::string Parameters::class_name(std::string_view name) const
{
    const Xml_Node node = find(name);
    if (!node)
        return {};
    if (!node.is(Tag::CLASSNAME) || node.attribute(At::NAME).empty())
        throw Wire_Error::status(CMPI_RC_ERR_INVALID_PARAMETER, std::string(name) + " is no class name");
    return std::string(node.attribute(At::NAME));
}

std::string Parameters::required_class_name(std::string_view name) const
{
    required(name);
    return class_name(name);
}

Property_List Parameters::names(std::string_view name) const
{
    const Xml_Node node = find(name);
    if (!node)
        return std::nullopt;
    if (!node.is(Tag::VALUE_ARRAY))
        throw Wire_Error::status(CMPI_RC_ERR_INVALID_PARAMETER, std::string(name) + " is no list");
    std::vector<std::string> result;
    std::size_t count = 0;
    for (const Xml_Node each : node.children()) {
        if (++count > MOST_NAMES)
            throw Wire_Error::status(CMPI_RC_ERR_INVALID_PARAMETER, std::string(name) + " is too long");
        if (std::ranges::none_of(result,
                                 [&](const std::string& have) { return same_name(have, each.text()); }))
            result.emplace_back(each.text());
    }
    return result;
}

} // namespace KPRV::kldrcim

// What a server answers: objects as they come, then the status; or why this is no answer.
#include "kldrcim/client/Cim_Answer.h"

#include "broker/values/Control_Text.h"
#include "broker/values/Type_Words.h"
#include "kldrcim/client/Cim_Request.h"
#include "kldrcim/connection/Connection.h"
#include "kldrcim/wire/Instance_Reading.h"
#include "kldrcim/wire/Wire_Text.h"

#include <algorithm>
#include <cstdlib>

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;
using At = Xml_Attribute;

/// Of what is kept: an object, or all that a method gives back. Objects are not, however many there are.
constexpr std::size_t MOST_KEPT = std::size_t(64) << 20;

std::string visible(std::string_view text)
{
    std::string result;
    for (text = text.substr(0, 500); !text.empty();) {
        const std::size_t control = control_size(text);
        result += control != 0 ? ' ' : text.front();
        text.remove_prefix(std::max(control, std::size_t(1)));
    }
    return result;
}

/// A header field with its %XX as the bytes that they stand for.
std::string decoded(const std::string& text)
{
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const std::string digits = text[i] == '%' ? text.substr(i + 1, 2) : "";
        const bool is_escape =
            digits.size() == 2 && digits.find_first_not_of("0123456789abcdefABCDEF") == std::string::npos;
        result += is_escape ? static_cast<char>(std::strtoul(digits.c_str(), nullptr, 16)) : text[i];
        i += is_escape ? 2 : 0;
    }
    return visible(result);
}

/// Servers that have nothing to say repeat the status in words.
Result failure(int code, std::string text)
{
    Result result;
    result.rc = static_cast<CMPIrc>(code > 0 ? code : CMPI_RC_ERR_FAILED);
    for (const std::string& word : {std::string(status_name(code)), code_text(code)})
        if (text.starts_with(word)) {
            text.erase(0, word.size());
            text.erase(0, std::min(text.find_first_not_of(": "), text.size()));
        }
    result.message = visible(text);
    return result;
}

Plain_Value return_value(const Instance_Reader& reader, Xml_Node node, const Method_Info* method)
{
    const bool is_typed =
        node.has(At::PARAMTYPE) || node.has(At::EmbeddedObject) || node.has(At::EMBEDDEDOBJECT);
    return !is_typed && method ? reader.value(node.first(), method->return_type) : reader.return_value(node);
}

} // namespace

Cim_Answer::Cim_Answer(Http_Sender& http, Take take)
    : _http(http), _take(std::move(take)),
      _reader({.bytes = MOST_KEPT}, [this](Xml_Node node) { _has_enough = _has_enough || !_take(node); })
{
}

bool Cim_Answer::read(const Http_Head& head, std::string_view piece)
{
    if (head.status == 200 && !_reader.feed(piece))
        refuse(_reader.fault_text());
    return !_has_enough;
}

void Cim_Answer::refuse(const std::string& why) const
{
    throw Connection_Error(_http.settings().url.text() +
                           " is no CIM server, or a broken one: " + visible(why));
}

void Cim_Answer::check(const Http_Head& head) const
{
    const Server_Url& url = _http.settings().url;
    const std::string status = "HTTP status " + std::to_string(head.status);
    if (head.status == 200)
        return;
    if (head.status == 401)
        throw Connection_Error(url.user ? url.text() + " does not know the user " + *url.user +
                                              " with this password"
                                        : url.text() + " wants to know who asks: http://USER@HOST");
    if (head.status == 403)
        throw Connection_Error(url.text() + " forbids it (" + status + ")");
    const std::string error = head.field("cimerror"), details = decoded(head.field("pgerrordetail"));
    if (!error.empty())
        throw Connection_Error(url.text() + " refused the request: " + visible(error) +
                               (details.empty() ? "" : ": " + details));
    if (head.status == 503)
        throw Connection_Error(url.text() + " has no time now (" + status + ")");
    refuse(status);
}

Result Cim_Answer::ask(const Http_Message& message, const Class_Catalogue& catalogue,
                       const Method_Info* method)
{
    const auto patience = _http.settings().patience;
    // What a method does may take ten times as long: a test, or an adapter's firmware.
    const bool is_method = message.body.find("<METHODCALL") != std::string::npos;
    try {
        const Http_Head head = _http.post(
            message,
            [this](const Http_Head& answered, std::string_view piece) { return read(answered, piece); },
            is_method ? 10 * patience : patience);
        return result(head, catalogue, method);
    } catch (const Wire_Error& error) {
        refuse(error.what());
    }
}

Result Cim_Answer::result(const Http_Head& head, const Class_Catalogue& catalogue,
                          const Method_Info* method) const
{
    check(head);
    Result result;
    result.stopped = _has_enough;
    if (_has_enough)
        return result;
    if (const std::string trailer = head.field("cimstatuscode"); !trailer.empty() && trailer != "0")
        return failure(std::atoi(trailer.c_str()), decoded(head.field("cimstatuscodedescription")));
    auto& reader = const_cast<Xml_Reader&>(_reader);
    if (!reader.finish())
        refuse(reader.fault_text());
    const Xml_Node answer = reader.document().root().child(Tag::MESSAGE).child(Tag::SIMPLERSP).first();
    if (!answer)
        refuse("a message without an answer");
    if (const Xml_Node error = answer.child(Tag::ERROR))
        return failure(std::atoi(std::string(error.attribute(At::CODE)).c_str()),
                       std::string(error.attribute(At::DESCRIPTION)));
    const Instance_Reader instances(catalogue);
    for (const Xml_Node node : answer.children())
        if (node.is(Tag::RETURNVALUE))
            result.return_value = return_value(instances, node, method);
        else if (node.is(Tag::PARAMVALUE))
            result.out.push_back(
                instances.parameter(node, method ? method->parameter(node.attribute(At::NAME)) : nullptr));
    return result;
}

namespace {

/// As the class has them; what it does not know comes last.
void put_in_order(std::vector<Named_Value>& values, const Class_Info& info)
{
    const Feature_Info* const end = info.properties.data() + info.properties.size();
    std::vector<std::pair<const Feature_Info*, Named_Value>> placed;
    placed.reserve(values.size());
    for (Named_Value& each : values) {
        const Feature_Info* const place = info.property(each.name);
        placed.emplace_back(place ? place : end, std::move(each));
    }
    std::ranges::stable_sort(placed, {}, [](const auto& each) { return each.first; });
    for (std::size_t i = 0; i < values.size(); ++i)
        values[i] = std::move(placed[i].second);
}

/// Makes of an element what the module would have handed over.
class Object_Taker
{
public:
    Object_Taker(const Class_Catalogue& catalogue, const Request& request, Receiver& receiver)
        : _reader(catalogue), _catalogue(catalogue), _request(request), _receiver(receiver)
    {
    }

    bool take(Xml_Node node)
    {
        switch (node.tag()) {
        case Tag::INSTANCENAME:
        case Tag::OBJECTPATH:
        case Tag::INSTANCEPATH:
            return _receiver.path(settled(_reader.path(node)));
        case Tag::INSTANCE: {
            Instance_Value instance = _reader.instance(node);
            const std::string class_name = instance.path.class_name;
            instance.path = _request.path;
            instance.path.class_name = class_name;
            return hand_over(std::move(instance));
        }
        default:
            return hand_over(_reader.instance_with_path(node));
        }
    }

private:
    bool hand_over(Instance_Value instance)
    {
        instance.path = settled(std::move(instance.path));
        if (_request.properties)
            std::erase_if(instance.properties, [&](const Named_Value& property) {
                return !contains_name(*_request.properties, property.name);
            });
        if (const Class_Info* const info = _catalogue.find(instance.path.class_name))
            put_in_order(instance.properties, *info);
        return _receiver.instance(std::move(instance));
    }

    /// Without the server's host, in its name space, with the keys in the order of the class.
    Path_Value settled(Path_Value path) const
    {
        path.host.clear();
        if (path.name_space.empty())
            path.name_space = _request.path.name_space;
        if (const Class_Info* const info = _catalogue.find(path.class_name))
            put_in_order(path.keys, *info);
        return path;
    }

    const Instance_Reader _reader;
    const Class_Catalogue& _catalogue;
    const Request& _request;
    Receiver& _receiver;
};

/// Some servers take the keys that a list leaves out from the paths, too. What was not asked for goes no
/// further.
Request with_keys(Request request, const Class_Catalogue& catalogue)
{
    const Class_Info* const info = request.properties && request.operation == Operation::ENUMERATE_INSTANCES
                                       ? catalogue.find(request.path.class_name)
                                       : nullptr;
    if (info)
        for (const Feature_Info& each : info->properties)
            if (each.key && !contains_name(*request.properties, each.name))
                request.properties->push_back(each.name);
    return request;
}

} // namespace

Result ask_for_objects(Http_Sender& http, const Class_Catalogue& catalogue, const Request& request,
                       Receiver& receiver)
{
    const Class_Info* const info =
        request.operation == Operation::INVOKE_METHOD ? catalogue.find(request.path.class_name) : nullptr;
    Object_Taker taker(catalogue, request, receiver);
    Cim_Answer answer(http, [&](Xml_Node node) { return taker.take(node); });
    return answer.ask(write_request(with_keys(request, catalogue)), catalogue,
                      info ? info->method(request.method) : nullptr);
}

} // namespace KPRV::kldrcim

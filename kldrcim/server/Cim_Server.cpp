#include "kldrcim/server/Cim_Server.h"

#include "kldrcim/wire/Instance_Reading.h"

#include <new>

namespace KPRV::kldrcim {

namespace {

const Operation_Row* find_row(std::string_view name)
{
    for (const auto rows : {instance_operations(), association_operations(), class_operations(),
                            pull_operations(), query_operations()})
        for (const Operation_Row& row : rows)
            if (same_name(row.name, name))
                return &row;
    return nullptr;
}

/// The exception of a provider is what there is to know.
std::string text_of(const Result& result)
{
    return result.exception ? *result.exception : result.message;
}

} // namespace

Request Operation_Call::request(Operation operation, Path_Value path) const
{
    Request request;
    request.operation = operation;
    request.path = std::move(path);
    request.path.host.clear();
    request.path.name_space = space.name();
    if (user)
        request.context.push_back({CMPIPrincipal, Plain_Value::text(*user)});
    return request;
}

Path_Value Operation_Call::path(std::string_view parameter) const
{
    const Xml_Node node = parameters.required(parameter);
    if (!node.is(Xml_Tag::INSTANCENAME))
        throw Wire_Error::status(CMPI_RC_ERR_INVALID_PARAMETER,
                                 std::string(parameter) + " names no instance");
    Path_Value path = Instance_Reader(space.classes()).path(node);
    path.name_space = space.name();
    return path;
}

Cim_Server::Cim_Server(std::string host_name) : _host_name(std::move(host_name)) {}

Cim_Space* Cim_Server::find_space(const std::string& name) const
{
    for (const auto& [each, space] : _spaces)
        if (same_name(each, name))
            return space;
    return nullptr;
}

bool Cim_Server::may_be_long(const Cim_Message& message)
{
    const Cim_Call& call = message.calls.front();
    const Operation_Row* row = call.is_extrinsic ? nullptr : find_row(call.name);
    return message.is_multiple || (row && row->may_be_long);
}

bool Cim_Server::answer_call(const Cim_Call& call, const std::optional<std::string>& user, Answer& answer)
{
    const Operation_Row* row = call.is_extrinsic ? nullptr : find_row(call.name);
    if (!row && !call.is_extrinsic)
        throw Wire_Error::status(CMPI_RC_ERR_NOT_SUPPORTED, "no operation " + call.name.substr(0, 64));
    Cim_Space* const space = find_space(call.name_space);
    if (!space)
        throw Wire_Error::status(CMPI_RC_ERR_INVALID_NAMESPACE, call.name_space);
    const Parameters parameters(call, row ? row->parameters : "");
    const Operation_Call operation{*this, *space, call, parameters, user, answer};
    const Result result = row ? row->body(operation) : call_method(operation);
    if (!result.ok())
        return answer.fail(result.rc, text_of(result));
    answer.succeed();
    return false;
}

Cim_Server::Reply Cim_Server::answer(const Cim_Message& message, const std::optional<std::string>& user,
                                     Body_Sink& sink)
{
    Answer answer(message, sink);
    Reply reply;
    for (const Cim_Call& call : message.calls) {
        answer.begin(call);
        try {
            reply.broken = answer_call(call, user, answer);
        } catch (const Wire_Error& error) {
            if (error.is_not_valid() && &call == &message.calls.front())
                throw Http_Refusal{400, "request-not-valid", error.what()};
            reply.broken =
                answer.fail(error.is_not_valid() ? CMPI_RC_ERR_INVALID_PARAMETER : error.rc(), error.what());
        } catch (const std::exception& error) {
            reply.broken = answer.fail(CMPI_RC_ERR_FAILED, error.what());
        }
        // What was asked for by somebody who has gone is not begun.
        if (reply.broken || answer.is_unread())
            return reply;
    }
    answer.end();
    reply.body = answer.take_rest();
    return reply;
}

} // namespace KPRV::kldrcim

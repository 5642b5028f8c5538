#include "module/agent/Method.h"

#include "module/adapter/Json_Access.h"
#include "module/agent/Agent_Errors.h"
#include "module/agent/Method_Shapes.h"
#include "module/runtime/system/log.h"

namespace KPRV {

namespace {

/// "aa:bb:cc:dd:ee:ff" has so many characters. Nothing else of a text is looked at.
constexpr size_t LENGTH_OF_A_MAC = 17;

void check_count(const Method& method, const Json::Value& params)
{
    const unsigned expected = method.count();
    if (expected == 0 || params.size() == expected)
        return;
    LOG(WARN, "No. of Params - Expected : %d, Actual : %d, function : %s ", int(expected), int(params.size()),
        method.handler);
    throw ErrorParamMismatch();
}

void store(Json::Value& query, const Method_Member& member, const Json::Value& value)
{
    switch (member.kind) {
    case Method_Member::STRING:
        query[member.key] = asString(value);
        break;
    case Method_Member::INTEGER:
        query[member.key] = asInt(value);
        break;
    case Method_Member::BOOLEAN:
        query[member.key] = asBool(value);
        break;
    case Method_Member::ARRAY:
        query[member.key] = checked_array(value);
        break;
    case Method_Member::OBJECT:
        query[member.key] = checked_object(value);
        break;
    case Method_Member::ADDRESS: {
        const std::string address = asString(value);
        query[address.size() == LENGTH_OF_A_MAC ? "mac" : member.key] = address;
        break;
    }
    default:
        break;
    }
}

} // namespace

void call(const Method& method, const Json::Value& params, Json::Value& result)
{
    LOG(DBG, "Entering ProviderDiscoveryMethods::%s", method.handler);
    check_count(method, params);
    method.shape(method, params, result);
    // One of them has always said it in lower case.
    const char* const returning = method.shape == &Method_Shapes::request_id ? "returning" : "Returning";
    LOG(DBG, "%s ProviderDiscoveryMethods::%s", returning, method.handler);
}

Json::Value query_of(const Method& method, const Json::Value& params)
{
    Json::Value query;
    unsigned position = 0;
    for (const Method_Member& member : method.members) {
        if (member.takes_position())
            // The JSON library refuses the position if "params" is an object, which has a size too.
            store(query, member, params[position++]);
        else if (member.kind == Method_Member::ZERO)
            query[member.key] = 0;
        else if (member.kind == Method_Member::TEXT)
            query[member.key] = member.text;
    }
    return query;
}

const Json::Value& own_parameter(const Method& method, const Json::Value& params)
{
    unsigned position = 0;
    for (const Method_Member& member : method.members) {
        if (member.kind == Method_Member::OWN)
            break;
        position += member.takes_position();
    }
    return params[position];
}

const Json::Value& checked_array(const Json::Value& value)
{
    if (!isArrayOrNull(value))
        throw ErrorBadJsonArray();
    return value;
}

const Json::Value& checked_object(const Json::Value& value)
{
    if (!isObjectOrNull(value))
        throw ErrorBadJsonObject();
    return value;
}

} // namespace KPRV

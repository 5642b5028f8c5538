// Of `Method_Shapes`, those of methods that change settings.
#include "module/agent/Method_Shapes.h"

#include "contracts/adapter/HbaAgentError.h"
#include "module/adapter/Json_Access.h"
#include "module/agent/Agent_Errors.h"

#include <stdexcept>

namespace KPRV {

namespace {

/// Adapters have an alias entry point of their own; all other types of aliases are for the ports'.
Json::Value set_alias(const Method& method, const Json::Value& alias)
{
    const Json::Value& type = alias["type"];
    // Stricter than other texts: a missing one is no empty one.
    if (!type.isString())
        throw Not_Convertible("Type is not convertible to string");
    const std::string text = asString(type);
    return text == "Node" || text == "CNA" ? libSetAdapterAlias(alias) : method.ask(alias);
}

} // namespace

void Method_Shapes::alias_of_type(const Method& method, const Json::Value& params, Json::Value& result)
{
    result = set_alias(method, own_parameter(method, params));
}

void Method_Shapes::each_alias(const Method& method, const Json::Value& params, Json::Value& result)
{
    for (const Json::Value& alias : checked_array(own_parameter(method, params)))
        result.append(set_alias(method, alias));
}

void Method_Shapes::lun_masks(const Method& method, const Json::Value& params, Json::Value& result)
{
    Json::Value query = query_of(method, params);
    const Json::Value& data = own_parameter(method, params);
    // The library gets all three, an absent list as null.
    for (const char* list : {"removedLunMaskData", "addedLunMaskData"})
        query[list] = checked_array(data[list]);
    query["clearLunMaskData"] = asBool(data["clearLunMaskData"]);
    result = method.ask(query);
}

void Method_Shapes::io_profiles(const Method& method, const Json::Value& params, Json::Value& result)
{
    constexpr const char* lists[] = {"addedAdvancedIoProfiles", "removedAdvancedIoProfiles"};
    Json::Value query = query_of(method, params);
    const Json::Value& profiles = checked_object(own_parameter(method, params));
    if (!hasMember(profiles, lists[0]) && !hasMember(profiles, lists[1]))
        throw ErrorBadJsonObject();
    for (const char* list : lists) {
        if (hasMember(profiles, list))
            query[list] = checked_array(profiles[list]);
    }
    result = method.ask(query);
}

void Method_Shapes::each_port_reset(const Method& method, const Json::Value& params, Json::Value& result)
{
    const Json::Value& ports = checked_array(own_parameter(method, params));
    Json::Value query;
    unsigned failures = 0;
    for (const Json::Value& port : ports) {
        query["indexStr"] = asString(port);
        try {
            result.append(method.ask(query));
        } catch (const HbaAgentError&) {
            // A port that is gone must not keep the others from their reset; nothing tells which it was.
            failures++;
        }
    }
    // An empty array fails too: it has reset nothing.
    if (failures == ports.size())
        throw std::runtime_error("Couldnt reset any of the port statistics");
}

} // namespace KPRV

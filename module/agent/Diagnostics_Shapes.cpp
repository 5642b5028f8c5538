// Of `Method_Shapes`, those of methods that test.
#include "module/agent/Method_Shapes.h"

#include "module/adapter/Json_Access.h"

#include <algorithm>

namespace KPRV {

void Method_Shapes::each_target(const Method& method, const Json::Value& params, Json::Value& result)
{
    // All other parameters are read before the targets.
    Json::Value query = query_of(method, params);
    for (const Json::Value& target : checked_array(own_parameter(method, params))) {
        query["vfID"] = std::max(asInt(target["vfID"]), 0);
        for (const char* key : {"portWwn", "localPortWwn", "remotePortWwn"})
            query[key] = asString(target[key]);
        result = method.ask(query);
    }
}

void Method_Shapes::request_id(const Method&, const Json::Value&, Json::Value& result)
{
    result = libGetRequestID();
}

} // namespace KPRV

#include "module/agent/Method_Shapes.h"

namespace KPRV {

void Method_Shapes::assigned(const Method& method, const Json::Value& params, Json::Value& result)
{
    result = method.ask(query_of(method, params));
}

void Method_Shapes::wrapped(const Method& method, const Json::Value& params, Json::Value& result)
{
    // The array hides an "error" of the answer from the dispatcher: the client finds it in the element.
    result.append(method.ask(query_of(method, params)));
}

void Method_Shapes::passed_on(const Method& method, const Json::Value& params, Json::Value& result)
{
    result = method.ask(params);
}

} // namespace KPRV

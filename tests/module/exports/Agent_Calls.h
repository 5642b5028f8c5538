#pragma once

#include "tests/module/exports/Module_Fixture.h"

#include <json/json.h>

#include <sstream>

namespace KPRV {

/// The agent's protocol as its client has it: through the CIM method of the built module.
class Agent_Calls : public Module_Fixture
{
protected:
    static inline const broker::Path_Value SERVICE = {
        {},
        "root/kaldera",
        "KALDERA_AgentService",
        {{"Name", broker::Plain_Value::text("Kaldera Agent Service Provider")}}};

    broker::Result execute(const std::string& request, const std::string& method = "executeMethod")
    {
        return server->invoke_method(SERVICE, method, {{"request", broker::Plain_Value::text(request)}});
    }
    /// The text of `response`, of a call that must succeed: it does so whatever the text says.
    static std::string response_of(const broker::Result& result)
    {
        EXPECT_EQ(CMPI_RC_OK, result.rc) << result.message;
        EXPECT_EQ(1u, result.done_count);
        EXPECT_EQ(CMPI_uint32, result.return_value.type);
        EXPECT_FALSE(result.return_value.null);
        EXPECT_EQ(0u, result.return_value.as_uint());
        EXPECT_EQ(1u, result.out.size());
        const broker::Plain_Value* const response = find_value(result.out, "response");
        if (!response || response->null || response->type != CMPI_string) {
            ADD_FAILURE() << "no response";
            return "";
        }
        return response->as_text();
    }
    static Json::Value json(const std::string& text)
    {
        Json::Value value;
        std::istringstream(text) >> value;
        return value;
    }
    Json::Value reply(const std::string& request) { return json(response_of(execute(request))); }
    Json::Value call(const std::string& method, const std::string& params)
    {
        return reply(R"({"method": ")" + method + R"(", "params": )" + params + "}");
    }
};

} // namespace KPRV

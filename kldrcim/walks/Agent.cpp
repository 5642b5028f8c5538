#include "kldrcim/walks/Agent.h"

namespace KPRV::kldrcim {

namespace {

/// The one instance of the agent's class.
constexpr const char* agent_class = "KALDERA_AgentService";
constexpr const char* agent_name = "Kaldera Agent Service Provider";

} // namespace

Result call_agent(Connection& connection, const std::string& request)
{
    Path_Value path;
    path.class_name = agent_class;
    path.keys = {{"Name", Plain_Value::text(agent_name)}};
    Result result =
        connection.invoke_method(path, "executeMethod", {{"request", Plain_Value::text(request)}});
    if (result.ok() && !find_value(result.out, "response")) {
        result.rc = CMPI_RC_ERR_FAILED;
        result.message = "executeMethod gave no response";
    }
    return result;
}

const std::string& agent_reply(const Result& answer)
{
    return find_value(answer.out, "response")->as_text();
}

} // namespace KPRV::kldrcim

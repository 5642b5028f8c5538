#include "module/agent/JsonRpcManager.h"
#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_AgentService_Skeleton.h"

#include <cstring>
#include <new>

namespace KPRV {

namespace {

/// A logged text has always been its own format: two percent signs are one in the log. As a format it could
/// also name arguments that are not there, and a client writes the texts.
std::string as_logged(const char* told)
{
    std::string text = told;
    for (size_t at = text.find("%%"); at != text.npos; at = text.find("%%", at + 1))
        text.erase(at, 1);
    return text;
}

void log_text(Call_Site site, const char* text)
{
    // Texts are long, and most logs do not want them.
    if (!log_uses(Log_Level::DBG))
        return;
    if (!strstr(text, "%%")) {
        log(Log_Level::DBG, site.file, site.line, "%s", text);
        return;
    }
    try {
        log(Log_Level::DBG, site.file, site.line, "%s", as_logged(text).c_str());
    } catch (const std::bad_alloc&) {
        // A request does not fail for want of a line.
    }
}

} // namespace

class KALDERA_AgentService_Provider : public KALDERA_AgentService_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_AgentService*,
                                         Enum_Instances_Handler<KALDERA_AgentService>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(server_instances(AGENTSERVICE), *handler, SAYING(ERR, "No AgentService Found!"));
    }

    /// The tunnel of the JSON-RPC protocol. It succeeds whatever comes of the request: the outcome is inside
    /// the response. What the dispatcher lets out goes on into the server.
    Invoke_Method_Status executeMethod(const KALDERA_AgentService*, Property<String>& response,
                                       const Property<String>& request, Property<uint32>& return_value)
    {
        LOG_SCOPE("executeMethod");
        // A null request is an empty text.
        log_text(LOG_HERE, request.value.c_str());
        String reply;
        JsonRpcManager::instance()->answer({request.value.c_str(), request.value.size()}, reply);
        LOG(DBG, "rpcResponse : %s", reply.c_str());
        log_text(LOG_HERE, reply.c_str());
        response.set(std::move(reply));
        return_value.set(0);
        return INVOKE_METHOD_OK;
    }
};

PROVIDER_PROC(KALDERA_AgentService)

} // namespace KPRV

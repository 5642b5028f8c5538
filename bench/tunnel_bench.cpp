#include "bench/Libraries.h"
#include "bench/Twins.h"
#include "bench/plain_tunnel.h"

namespace KPRV::bench {

namespace {

Twins tunnel(const char* size, const std::string& method, const std::string& params)
{
    CMPIMethodMI* const mi = Module::get().methods("KALDERA_AgentService");
    const std::string request =
        "{\"method\": \"" + method + "\", \"params\": " + params + ", \"id\": 1, \"version\": \"1.1\"}";
    return {
        .name = std::string("B4 executeMethod/") + size,
        .prepare = [] { Fast_Library::get().prepare({}); },
        .ours =
            [mi, request](Lean_Broker& server) {
                CMPIObjectPath* const service = server.path("KALDERA_AgentService");
                server.add_key(service, "Name", "Kaldera Agent Service Provider");
                CMPIArgs* const in = server.args();
                CMPIArgs* const out = server.args();
                server.add_argument(in, "request", request.c_str());
                mi->ft->invokeMethod(mi, server.context(), server.result(), service, "executeMethod", in,
                                     out);
                server.deliver(Lean_Broker::text_argument(out, "response"));
            },
        .plain = [request](Lean_Broker& server) { server.deliver(plain_rpc(request).c_str()); },
    };
}

} // namespace

void add_tunnel(bool)
{
    for (const Twins& twins : {tunnel("no-op", "discovery.getServerTime", "[]"),
                               tunnel("25 members", "discovery.getFcByFcWwn", "[\"25 members\"]"),
                               tunnel("30 KB", "discovery.getFcByFcWwn", "[\"30 KB\"]")}) {
        check_equal(twins);
        add(twins);
    }
}

} // namespace KPRV::bench

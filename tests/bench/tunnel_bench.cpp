#include "tests/bench/Libraries.h"
#include "tests/bench/Twins.h"
#include "tests/bench/plain_tunnel.h"

namespace KPRV::bench {

namespace {

/// Has the server make the objects of a call, and deliver the response that the call has put among them.
template <class Call>
void invoke(Lean_Broker& server, const std::string& request, Call call)
{
    CMPIObjectPath* const service = server.path("KALDERA_AgentService");
    server.add_key(service, "Name", "Kaldera Agent Service Provider");
    CMPIArgs* const in = server.args();
    CMPIArgs* const out = server.args();
    server.add_argument(in, "request", request.c_str());
    call(service, in, out);
    server.deliver(Lean_Broker::text_argument(out, "response"));
}

struct Size
{
    const char* name;
    std::string request;
};

Size size(const char* name, const std::string& method, const std::string& params)
{
    return {name,
            "{\"method\": \"" + method + "\", \"params\": " + params + ", \"id\": 1, \"version\": \"1.1\"}"};
}

Twins tunnel(const Size& size)
{
    CMPIMethodMI* const mi = Module::get().methods("KALDERA_AgentService");
    return {
        .name = std::string("B4 executeMethod/") + size.name,
        .prepare = [] { Fast_Library::get().prepare({}); },
        .ours =
            [mi, request = size.request](Lean_Broker& server) {
                invoke(server, request, [&](CMPIObjectPath* service, CMPIArgs* in, CMPIArgs* out) {
                    mi->ft->invokeMethod(mi, server.context(), server.result(), service, "executeMethod", in,
                                         out);
                });
            },
        .plain =
            [request = size.request](Lean_Broker& server) {
                invoke(server, request, [&](CMPIObjectPath*, CMPIArgs* in, CMPIArgs* out) {
                    plain_execute_method(server.result(), in, out);
                });
            },
    };
}

/// The same against the loop alone, which no server calls.
Twins bare_tunnel(const Size& size)
{
    Twins twins = tunnel(size);
    twins.name = std::string("B4 executeMethod against the bare loop/") + size.name;
    twins.plain = [request = size.request](Lean_Broker& server) {
        server.deliver(plain_rpc(request).c_str());
    };
    return twins;
}

} // namespace

void add_tunnel(bool)
{
    for (const Size& size : {size("no-op", "discovery.getServerTime", "[]"),
                             size("25 members", "discovery.getFcByFcWwn", "[\"25 members\"]"),
                             size("30 KB", "discovery.getFcByFcWwn", "[\"30 KB\"]")}) {
        for (const Twins& twins : {tunnel(size), bare_tunnel(size)}) {
            check_equal(twins);
            add(twins);
        }
    }
}

} // namespace KPRV::bench

#include "bench/Libraries.h"
#include "bench/Plain_Provider.h"
#include "bench/Twins.h"
#include "bench/plain_support.h"

#include <algorithm>
#include <cstdio>

namespace KPRV::bench {

namespace {

/// Adapters have at most this many ports; a larger host has more adapters.
constexpr unsigned PORTS_OF_ADAPTER = 8;

Storage_Size host_with(unsigned ports)
{
    return {.adapters = (ports + PORTS_OF_ADAPTER - 1) / PORTS_OF_ADAPTER,
            .ports = std::min(ports, PORTS_OF_ADAPTER)};
}

CMPIObjectPath* path_of_port(Lean_Broker& server, unsigned number)
{
    char host[256], address[32];
    plain_host_name(host, sizeof host);
    snprintf(address, sizeof address, "20008c7c%08x", number);
    CMPIObjectPath* const path = server.path("KALDERA_FCPort");
    server.add_key(path, "CreationClassName", "KALDERA_FCPort");
    server.add_key(path, "SystemCreationClassName", "KALDERA_ComputerSystem");
    server.add_key(path, "SystemName", host);
    server.add_key(path, "DeviceID", address);
    return path;
}

Twins enumeration(unsigned ports)
{
    CMPIInstanceMI* const mi = Module::get().instances("KALDERA_FCPort");
    return {
        .name = "B1 enumerate FC ports/" + std::to_string(ports),
        .prepare = [ports] { Fast_Library::get().prepare(host_with(ports)); },
        .ours =
            [mi](Lean_Broker& server) {
                mi->ft->enumerateInstances(mi, server.context(), server.result(),
                                           server.path("KALDERA_FCPort"), nullptr);
            },
        .plain =
            [](Lean_Broker& server) {
                plain_enumerate_fc_ports(server.broker(), server.result(), server.path("KALDERA_FCPort"));
            },
    };
}

Twins last_port(unsigned ports)
{
    CMPIInstanceMI* const mi = Module::get().instances("KALDERA_FCPort");
    return {
        .name = "B2 get the last FC port/" + std::to_string(ports),
        .prepare = [ports] { Fast_Library::get().prepare(host_with(ports)); },
        .ours =
            [mi, ports](Lean_Broker& server) {
                mi->ft->getInstance(mi, server.context(), server.result(), path_of_port(server, ports - 1),
                                    nullptr);
            },
        .plain =
            [ports](Lean_Broker& server) {
                plain_get_fc_port(server.broker(), server.result(), path_of_port(server, ports - 1));
            },
    };
}

} // namespace

void add_fc_ports(bool tiny)
{
    for (const unsigned ports : {1u, 8u, 64u, 1024u}) {
        if (tiny && ports > 8)
            break;
        for (const Twins& twins : {enumeration(ports), last_port(ports)}) {
            check_equal(twins);
            add(twins);
        }
    }
}

} // namespace KPRV::bench

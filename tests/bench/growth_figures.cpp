#include "tests/bench/Figures.h"
#include "tests/bench/Lean_Broker.h"
#include "tests/bench/Libraries.h"
#include "tests/bench/plain_support.h"

#include <cstdio>
#include <malloc.h>
#include <unistd.h>

namespace KPRV::bench {

namespace {

struct Interfaces
{
    CMPIInstanceMI* ports = Module::get().instances("KALDERA_FCPort");
    CMPIInstanceMI* extents = Module::get().instances("KALDERA_StorageExtent");
    CMPIAssociationMI* paths = Module::get().associations("KALDERA_SCSIInitiatorTargetLogicalUnitPath");
    CMPIMethodMI* agent = Module::get().methods("KALDERA_AgentService");
};

/// One of each kind: enumeration, names, the one instance, one that is not there, far ends, a method.
void call(const Interfaces& mi, Lean_Broker& server, int kind)
{
    server.begin_call();
    CMPIObjectPath* const port = server.path("KALDERA_FCPort");
    switch (kind % 5) {
    case 0:
        mi.ports->ft->enumerateInstances(mi.ports, server.context(), server.result(), port, nullptr);
        break;
    case 1:
        mi.extents->ft->enumerateInstanceNames(mi.extents, server.context(), server.result(),
                                               server.path("KALDERA_StorageExtent"));
        break;
    case 2:
        server.add_key(port, "DeviceID", "0");
        mi.ports->ft->getInstance(mi.ports, server.context(), server.result(), port, nullptr);
        break;
    case 3:
        server.add_key(port, "DeviceID", "20008c7c00000000");
        mi.paths->ft->associatorNames(mi.paths, server.context(), server.result(), port, nullptr, nullptr,
                                      nullptr, nullptr);
        break;
    default: {
        CMPIArgs* const in = server.args();
        server.add_argument(in, "request", R"({"method": "discovery.getServerTime", "params": []})");
        mi.agent->ft->invokeMethod(mi.agent, server.context(), server.result(),
                                   server.path("KALDERA_AgentService"), "executeMethod", in, server.args());
    }
    }
}

long resident_bytes()
{
    long total = 0, resident = 0;
    FILE* const file = fopen("/proc/self/statm", "r");
    if (file) {
        if (fscanf(file, "%ld %ld", &total, &resident) != 2)
            resident = 0;
        fclose(file);
    }
    return resident * sysconf(_SC_PAGESIZE);
}

} // namespace

void print_growth_figures(bool tiny)
{
    Fast_Library::get().prepare({.adapters = 1, .ports = 2, .targets = 2, .luns = 2});
    const Interfaces interfaces;
    Lean_Broker& server = Lean_Broker::get();
    const int calls = tiny ? 1000 : 100000;
    const auto run = [&](int count) {
        for (int i = 0; i < count; i++)
            call(interfaces, server, i);
    };
    // Until what is made on first use stands, and the heap lies as the measuring leaves it.
    for (int i = 0; i < 2; i++) {
        run(calls / 10);
        resident_bytes();
    }
    const long resident = resident_bytes();
    const size_t live = mallinfo2().uordblks;
    run(calls);
    const long live_grown = long(mallinfo2().uordblks - live), resident_grown = resident_bytes() - resident;
    printf("B5 live memory grown over %d calls\t%ld\tbytes\n", calls, live_grown);
    printf("B5 resident memory grown over %d calls\t%ld\tbytes\n", calls, resident_grown);
}

} // namespace KPRV::bench

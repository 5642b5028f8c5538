#include "bench/Libraries.h"
#include "bench/Plain_Provider.h"
#include "bench/Twins.h"
#include "bench/plain_support.h"

#include <cstdio>

namespace KPRV::bench {

namespace {

constexpr const char* PATH_CLASS = "KALDERA_SCSIInitiatorTargetLogicalUnitPath";

std::string words(const Storage_Size& size)
{
    return std::to_string(size.all_ports()) + "x" + std::to_string(size.targets) + "x" +
           std::to_string(size.luns);
}

/// The first logical unit, whose id all sizes have.
CMPIObjectPath* first_unit(Lean_Broker& server)
{
    char host[256];
    plain_host_name(host, sizeof host);
    CMPIObjectPath* const path = server.path("KALDERA_StorageExtent");
    server.add_key(path, "CreationClassName", "KALDERA_StorageExtent");
    server.add_key(path, "SystemCreationClassName", "KALDERA_ComputerSystem");
    server.add_key(path, "SystemName", host);
    server.add_key(path, "DeviceID", "20008c7c00000000_5006016000000000_ACME_Array 9000_LUN_0");
    return path;
}

Twins paths(const Storage_Size& size, plain_ends rival_ends)
{
    CMPIInstanceMI* const mi = Module::get().instances(PATH_CLASS);
    const char* const rival = rival_ends == plain_ends::once ? " against ends made once" : "";
    return {
        .name = std::string("B3 enumerate paths") + rival + "/" + words(size),
        .prepare = [size] { Fast_Library::get().prepare(size); },
        .ours =
            [mi](Lean_Broker& server) {
                mi->ft->enumerateInstances(mi, server.context(), server.result(), server.path(PATH_CLASS),
                                           nullptr);
            },
        .plain =
            [rival_ends](Lean_Broker& server) {
                plain_enumerate_paths(server.broker(), server.result(), server.path(PATH_CLASS), rival_ends);
            },
        .slow = size.all_paths() > 10000,
    };
}

Twins ends(const Storage_Size& size)
{
    CMPIAssociationMI* const mi = Module::get().associations(PATH_CLASS);
    return {
        .name = "B3 ends of one logical unit/" + words(size),
        .prepare = [size] { Fast_Library::get().prepare(size); },
        .ours =
            [mi](Lean_Broker& server) {
                mi->ft->associatorNames(mi, server.context(), server.result(), first_unit(server), PATH_CLASS,
                                        nullptr, nullptr, nullptr);
            },
        .plain =
            [](Lean_Broker& server) {
                plain_path_associator_names(server.broker(), server.result(), first_unit(server));
            },
        .slow = size.all_paths() > 10000,
    };
}

} // namespace

void add_paths(bool tiny)
{
    constexpr Storage_Size smallest = {.adapters = 1, .ports = 2, .targets = 2, .luns = 2};
    constexpr Storage_Size sizes[] = {
        {.adapters = 4, .ports = 2, .targets = 16, .luns = 16},
        {.adapters = 8, .ports = 2, .targets = 32, .luns = 32},
        {.adapters = 8, .ports = 2, .targets = 64, .luns = 64},
    };
    for (const Twins& twins :
         {paths(smallest, plain_ends::of_each_path), paths(smallest, plain_ends::once), ends(smallest)}) {
        check_equal(twins);
        if (tiny)
            add(twins);
    }
    for (const Storage_Size& size : sizes) {
        if (tiny)
            break;
        add(paths(size, plain_ends::of_each_path));
        add(paths(size, plain_ends::once));
        add(ends(size));
    }
}

} // namespace KPRV::bench

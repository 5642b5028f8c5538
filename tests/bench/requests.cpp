#include "tests/bench/requests.h"

#include "tests/bench/Libraries.h"
#include "tests/bench/plain_support.h"

#include <cstdio>

namespace KPRV::bench {

namespace {

std::string host_name()
{
    char host[256];
    plain_host_name(host, sizeof host);
    return host;
}

std::string address(const char* prefix, unsigned number)
{
    char text[24];
    snprintf(text, sizeof text, "%s%08x", prefix, number);
    return text;
}

/// The keys of what belongs to the host, whose name is looked up once in the program, so that it is no part
/// of what is timed.
CMPIObjectPath* device_path(Lean_Broker& server, const char* class_name, const std::string& id)
{
    static const std::string host = host_name();
    return plain_device_path(server.broker(), class_name, host.c_str(), "DeviceID", id.c_str());
}

/// `path(server)` is what the request names, and `ours(server, path)` asks the module.
template <class Path, class Ours>
Twins twins(const std::string& name, const Storage_Size& size, Path path, Ours ours,
            const Plain_Operation& plain)
{
    return {
        .name = name,
        .prepare = [size] { Fast_Library::get().prepare(size); },
        .ours = [path, ours](Lean_Broker& server) { ours(server, path(server)); },
        .plain = [path,
                  plain](Lean_Broker& server) { plain(server.broker(), server.result(), path(server)); },
    };
}

} // namespace

Twins enumeration(const std::string& name, const char* class_name, const Storage_Size& size,
                  const Plain_Operation& plain)
{
    const auto path = [class_name](Lean_Broker& server) { return server.path(class_name); };
    const auto ours = [mi = Module::get().instances(class_name)](Lean_Broker& server, CMPIObjectPath* cop) {
        mi->ft->enumerateInstances(mi, server.context(), server.result(), cop, nullptr);
    };
    return twins(name, size, path, ours, plain);
}

Twins get_instance(const std::string& name, const char* class_name, const std::string& id,
                   const Storage_Size& size, const Plain_Operation& plain)
{
    const auto path = [=](Lean_Broker& server) { return device_path(server, class_name, id); };
    const auto ours = [mi = Module::get().instances(class_name)](Lean_Broker& server, CMPIObjectPath* cop) {
        mi->ft->getInstance(mi, server.context(), server.result(), cop, nullptr);
    };
    return twins(name, size, path, ours, plain);
}

Twins associator_names(const std::string& name, const char* association, const char* class_name,
                       const std::string& id, const Storage_Size& size, const Plain_Operation& plain)
{
    const auto path = [=](Lean_Broker& server) { return device_path(server, class_name, id); };
    const auto ours = [mi = Module::get().associations(association), association](Lean_Broker& server,
                                                                                  CMPIObjectPath* cop) {
        mi->ft->associatorNames(mi, server.context(), server.result(), cop, association, nullptr, nullptr,
                                nullptr);
    };
    return twins(name, size, path, ours, plain);
}

std::string last_fc_port(const Storage_Size& size)
{
    return address("20008c7c", size.all_ports() - 1);
}

std::string last_extent(const Storage_Size& size)
{
    return last_fc_port(size) + "_" + address("50060160", size.all_ports() * size.targets - 1) +
           "_ACME_Array 9000_LUN_" + std::to_string(size.luns - 1);
}

std::string last_adapter(const Storage_Size& size)
{
    return address("10008c7c", size.adapters - 1);
}

} // namespace KPRV::bench

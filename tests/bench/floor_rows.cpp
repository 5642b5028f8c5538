#include "tests/bench/Floor_Row.h"

#include "tests/bench/Libraries.h"
#include "tests/bench/Ready_Objects.h"
#include "tests/bench/plain_tunnel.h"

#include <memory>

namespace KPRV::bench {

namespace {

constexpr const char* ADAPTER = "KALDERA_PortController";
constexpr const char* DISK = "KALDERA_LogicalDisk";
constexpr const char* EXTENT = "KALDERA_StorageExtent";
constexpr const char* HOST = "KALDERA_ComputerSystem";
constexpr const char* PATH = "KALDERA_SCSIInitiatorTargetLogicalUnitPath";
constexpr const char* PORT = "KALDERA_FCPort";

constexpr Storage_Size SMALLEST = {.adapters = 2, .ports = 2, .targets = 2, .luns = 2};

/// Which of the objects of a class a request names.
enum class Which
{
    FIRST,
    LAST,
};

/// The path of an object, as the module itself names it.
class Named_Object
{
public:
    Named_Object(const char* class_name, Which which) : _class_name(class_name), _which(which) {}

    void prepare()
    {
        Lean_Broker& server = Lean_Broker::get();
        server.begin_call(true);
        CMPIInstanceMI* const mi = Module::get().instances(_class_name);
        mi->ft->enumerateInstanceNames(mi, server.context(), server.result(), server.path(_class_name));
        _names = std::make_unique<Ready_Objects>(server);
    }
    CMPIObjectPath* path(Lean_Broker& server) const
    {
        return _names->path(server, _which == Which::FIRST ? 0 : _names->size() - 1);
    }

private:
    const char* _class_name;
    Which _which;
    std::unique_ptr<Ready_Objects> _names;
};

std::function<void()> prepared(const Storage_Size& size)
{
    return [size] { Fast_Library::get().prepare(size); };
}

Floor_Row enumeration(const std::string& name, const char* class_name, const Storage_Size& size)
{
    const auto ours = [class_name](Lean_Broker& server) {
        CMPIInstanceMI* const mi = Module::get().instances(class_name);
        CMPIObjectPath* const path = server.path(class_name);
        return [=, &server] {
            mi->ft->enumerateInstances(mi, server.context(), server.result(), path, nullptr);
        };
    };
    return {.name = "enumerate " + name, .prepare = prepared(size), .ours = ours};
}

/// A request that names an object: `ask(server, path)` makes it.
template <class Ask>
Floor_Row about(const std::string& name, const char* class_name, Which which, const Storage_Size& size,
                Ask ask)
{
    const auto object = std::make_shared<Named_Object>(class_name, which);
    return {
        .name = name,
        .prepare =
            [=] {
                prepared(size)();
                object->prepare();
            },
        .ours = [=](Lean_Broker& server) { return ask(server, object->path(server)); },
    };
}

Floor_Row get_last(const std::string& name, const char* class_name, const Storage_Size& size)
{
    return about("get the last of " + name, class_name, Which::LAST, size,
                 [class_name](Lean_Broker& server, CMPIObjectPath* path) {
                     CMPIInstanceMI* const mi = Module::get().instances(class_name);
                     return [=, &server] {
                         mi->ft->getInstance(mi, server.context(), server.result(), path, nullptr);
                     };
                 });
}

/// The four ways to ask for what an object is associated with.
std::vector<Floor_Row> associations(const std::string& name, const char* association, const char* class_name,
                                    Which which, const Storage_Size& size)
{
    const auto row = [&](const char* operation, auto call) {
        return about(std::string(operation) + " " + name, class_name, which, size,
                     [=](Lean_Broker& server, CMPIObjectPath* path) {
                         CMPIAssociationMI* const mi = Module::get().associations(association);
                         return [=, &server] { call(mi, server, path, association); };
                     });
    };
    return {
        row("associators",
            [](CMPIAssociationMI* mi, Lean_Broker& server, CMPIObjectPath* path, const char* asked) {
                mi->ft->associators(mi, server.context(), server.result(), path, asked, nullptr, nullptr,
                                    nullptr, nullptr);
            }),
        row("associator names",
            [](CMPIAssociationMI* mi, Lean_Broker& server, CMPIObjectPath* path, const char* asked) {
                mi->ft->associatorNames(mi, server.context(), server.result(), path, asked, nullptr, nullptr,
                                        nullptr);
            }),
        row("references",
            [](CMPIAssociationMI* mi, Lean_Broker& server, CMPIObjectPath* path, const char* asked) {
                mi->ft->references(mi, server.context(), server.result(), path, asked, nullptr, nullptr);
            }),
        row("reference names",
            [](CMPIAssociationMI* mi, Lean_Broker& server, CMPIObjectPath* path, const char* asked) {
                mi->ft->referenceNames(mi, server.context(), server.result(), path, asked, nullptr);
            }),
    };
}

/// The floor of the agent's method is a plain method of a reader, a map of functions and a writer.
Floor_Row execute_method(const std::string& name, const std::string& method, const std::string& params)
{
    const std::string text =
        "{\"method\": \"" + method + "\", \"params\": " + params + ", \"id\": 1, \"version\": \"1.1\"}";
    const auto invocation = [text](auto call) {
        return [text, call](Lean_Broker& server) {
            CMPIObjectPath* const service = server.path("KALDERA_AgentService");
            server.add_key(service, "Name", "Kaldera Agent Service Provider");
            CMPIArgs* const in = server.args();
            CMPIArgs* const out = server.args();
            server.add_argument(in, "request", text.c_str());
            return [=, &server] {
                call(server, service, in, out);
                server.deliver(Lean_Broker::text_argument(out, "response"));
            };
        };
    };
    return {
        .name = "executeMethod, " + name,
        .prepare = prepared({}),
        .ours = invocation([](Lean_Broker& server, CMPIObjectPath* service, CMPIArgs* in, CMPIArgs* out) {
            static CMPIMethodMI* const mi = Module::get().methods("KALDERA_AgentService");
            mi->ft->invokeMethod(mi, server.context(), server.result(), service, "executeMethod", in, out);
        }),
        .floor = invocation([](Lean_Broker& server, CMPIObjectPath*, CMPIArgs* in, CMPIArgs* out) {
            plain_execute_method(server.result(), in, out);
        }),
    };
}

} // namespace

std::vector<Floor_Row> floor_rows(bool tiny)
{
    const auto size = [&](const Storage_Size& wanted) { return tiny ? SMALLEST : wanted; };
    const Storage_Size one_port = size({.adapters = 1, .ports = 1});
    const Storage_Size few_ports = size({.adapters = 8, .ports = 8});
    const Storage_Size many_ports = size({.adapters = 128, .ports = 8});
    const Storage_Size adapters = size({.adapters = 64, .ports = 2});
    const Storage_Size few_luns = size({.adapters = 1, .ports = 2, .targets = 4, .luns = 8});
    const Storage_Size luns = size({.adapters = 4, .ports = 2, .targets = 16, .luns = 16});
    const Storage_Size many_luns = size({.adapters = 8, .ports = 2, .targets = 32, .luns = 32});

    std::vector<Floor_Row> rows = {
        enumeration("1 FC port", PORT, one_port),
        enumeration("64 FC ports", PORT, few_ports),
        enumeration("1,024 FC ports", PORT, many_ports),
        enumeration("2,048 extents", EXTENT, luns),
        enumeration("16,384 extents", EXTENT, many_luns),
        enumeration("2,048 disks", DISK, luns),
        enumeration("16,384 disks", DISK, many_luns),
        enumeration("paths, 8 x 16 x 16", PATH, luns),
        enumeration("paths, 16 x 32 x 32", PATH, many_luns),
        get_last("1,024 FC ports", PORT, many_ports),
        get_last("2,048 extents", EXTENT, luns),
        get_last("2,048 paths", PATH, luns),
    };
    const auto add = [&](const std::vector<Floor_Row>& more) {
        rows.insert(rows.end(), more.begin(), more.end());
    };
    add(associations("from one of 2,048 LUNs to its path", PATH, EXTENT, Which::FIRST, luns));
    add({
        enumeration("64 adapters", ADAPTER, adapters),
        enumeration("64 adapters with 128 ports", "KALDERA_ControlledBy", adapters),
        enumeration("the host with 64 adapters", "KALDERA_PortControllerSystemDevice", adapters),
        enumeration("the host with 128 ports", "KALDERA_FCPortSystemDevice", adapters),
    });
    add(associations("from the last of 64 adapters to its ports", "KALDERA_ControlledBy", ADAPTER,
                     Which::LAST, adapters));
    add(associations("from the host to 64 adapters", "KALDERA_PortControllerSystemDevice", HOST, Which::FIRST,
                     adapters));
    add(associations("from the host to 64 LUNs", "KALDERA_StorageResourcesSystemDevice", HOST, Which::FIRST,
                     few_luns));
    add({
        execute_method("no-op", "discovery.getServerTime", "[]"),
        execute_method("25 members", "discovery.getFcByFcWwn", "[\"25 members\"]"),
        execute_method("30 KB", "discovery.getFcByFcWwn", "[\"30 KB\"]"),
    });
    return rows;
}

std::vector<Floor_Row> heap_rows(bool tiny)
{
    const Storage_Size size =
        tiny ? SMALLEST : Storage_Size{.adapters = 8, .ports = 2, .targets = 64, .luns = 64};
    return {
        get_last("65,536 extents", EXTENT, size),
        enumeration("65,536 extents", EXTENT, size),
        enumeration("65,536 paths", PATH, size),
    };
}

} // namespace KPRV::bench

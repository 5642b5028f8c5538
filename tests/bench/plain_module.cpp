// The plain providers as a CMPI module, which a real server loads in the place of the module: under its
// registrations, for the classes that have a plain provider. What they do not do is refused.

#include "tests/bench/Plain_Provider.h"
#include "tests/bench/plain_library.h"
#include "tests/bench/plain_tunnel.h"

#include <cmpidt.h>
#include <cmpift.h>

namespace KPRV::bench {

namespace {

/// What is done for a class; null for what is refused.
struct plain_class
{
    plain_operation* enumerate = nullptr;
    plain_operation* get = nullptr;
    plain_operation* associator_names = nullptr;
    /// Whose it is; the server's, from the first factory on.
    const CMPIBroker* broker = nullptr;
};

CMPIStatus refused()
{
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

template <class MI>
CMPIStatus call(const MI* mi, plain_operation* plain_class::*operation, const CMPIResult* result,
                const CMPIObjectPath* cop)
{
    const auto* const own = static_cast<const plain_class*>(mi->hdl);
    return own->*operation ? (own->*operation)(own->broker, result, cop) : refused();
}

template <class MI>
CMPIStatus clean_up(MI*, const CMPIContext*, CMPIBoolean)
{
    return {CMPI_RC_OK, nullptr};
}

constexpr CMPIVersion VERSION = 100;

const CMPIInstanceMIFT instance_table = [] {
    CMPIInstanceMIFT table = {};
    table.ftVersion = table.miVersion = VERSION;
    table.miName = "plain";
    table.cleanup = clean_up<CMPIInstanceMI>;
    table.enumerateInstanceNames = [](CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                      const CMPIObjectPath*) { return refused(); };
    table.enumerateInstances = [](CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* cop,
                                  const char**) { return call(mi, &plain_class::enumerate, result, cop); };
    table.getInstance = [](CMPIInstanceMI* mi, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath* cop,
                           const char**) { return call(mi, &plain_class::get, result, cop); };
    table.createInstance = [](CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                              const CMPIInstance*) { return refused(); };
    table.modifyInstance = [](CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                              const CMPIInstance*, const char**) { return refused(); };
    table.deleteInstance = [](CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*) {
        return refused();
    };
    table.execQuery = [](CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                         const char*, const char*) { return refused(); };
    return table;
}();

const CMPIAssociationMIFT association_table = [] {
    CMPIAssociationMIFT table = {};
    table.ftVersion = table.miVersion = VERSION;
    table.miName = "plain";
    table.cleanup = clean_up<CMPIAssociationMI>;
    table.associators = [](CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                           const char*, const char*, const char*, const char*,
                           const char**) { return refused(); };
    table.associatorNames = [](CMPIAssociationMI* mi, const CMPIContext*, const CMPIResult* result,
                               const CMPIObjectPath* cop, const char*, const char*, const char*,
                               const char*) { return call(mi, &plain_class::associator_names, result, cop); };
    table.references = [](CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                          const char*, const char*, const char**) { return refused(); };
    table.referenceNames = [](CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                              const CMPIObjectPath*, const char*, const char*) { return refused(); };
    return table;
}();

const CMPIMethodMIFT method_table = [] {
    CMPIMethodMIFT table = {};
    table.ftVersion = table.miVersion = VERSION;
    table.miName = "plain";
    table.cleanup = clean_up<CMPIMethodMI>;
    // Only the agent's service is asked for its one method.
    table.invokeMethod = [](CMPIMethodMI*, const CMPIContext*, const CMPIResult* result,
                            const CMPIObjectPath*, const char*, const CMPIArgs* in,
                            CMPIArgs* out) { return plain_execute_method(result, in, out); };
    return table;
}();

template <class MI, class Table>
MI* make(MI& mi, plain_class& own, const Table& table, const CMPIBroker* broker)
{
    plain_library::get();
    own.broker = broker;
    mi.hdl = &own;
    mi.ft = &table;
    return &mi;
}

CMPIStatus enumerate_paths(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath* cop)
{
    return plain_enumerate_paths(broker, result, cop, plain_join::index);
}

CMPIStatus ends_of_unit(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath* cop)
{
    return plain_path_associator_names(broker, result, cop, plain_join::index);
}

} // namespace

#define FACTORY(class_name, kind, table)                                                                     \
    extern "C" [[gnu::visibility("default")]] CMPI##kind##MI* class_name##_Provider_Create_##kind##MI(       \
        const CMPIBroker* broker, const CMPIContext*, CMPIStatus*)                                           \
    {                                                                                                        \
        static CMPI##kind##MI mi;                                                                            \
        return make(mi, class_name, table, broker);                                                          \
    }
#define PLAIN_CLASS(class_name, ...)                                                                         \
    static plain_class class_name = {__VA_ARGS__};                                                           \
    FACTORY(class_name, Instance, instance_table)                                                            \
    FACTORY(class_name, Method, method_table)
#define PLAIN_ASSOCIATION(class_name, ...)                                                                   \
    PLAIN_CLASS(class_name, __VA_ARGS__)                                                                     \
    FACTORY(class_name, Association, association_table)

PLAIN_CLASS(KALDERA_AgentService)
PLAIN_CLASS(KALDERA_FCPort, plain_enumerate_fc_ports, plain_get_fc_port)
PLAIN_CLASS(KALDERA_PortController, plain_enumerate_adapters, plain_get_adapter)
PLAIN_CLASS(KALDERA_StorageExtent, plain_enumerate_extents, plain_get_extent)
PLAIN_ASSOCIATION(KALDERA_ControlledBy, plain_enumerate_controlled_by, nullptr, plain_names_of_ports)
PLAIN_ASSOCIATION(KALDERA_SCSIInitiatorTargetLogicalUnitPath, enumerate_paths, nullptr, ends_of_unit)

} // namespace KPRV::bench

#include "tests/bench/Plain_Provider.h"
#include "tests/bench/plain_adapter.h"
#include "tests/bench/plain_walk.h"

#include <vector>

namespace KPRV::bench {

namespace {

struct controller
{
    Json::Value address;
    char id[24];
};

/// All of them before the first port is asked for, as the module does.
std::vector<controller> read_controllers()
{
    std::vector<controller> controllers;
    plain_for_each_adapter([&](const Json::Value& adapter) {
        const Json::Value& address = plain_adapter_address(adapter);
        if (address.isNull() || !plain_has_ports(adapter))
            return;
        controller& added = controllers.emplace_back(controller{address, {}});
        plain_flat(added.id, sizeof added.id, address.asCString());
    });
    return controllers;
}

CMPIObjectPath* port_path(const CMPIBroker* broker, const char* host, const Json::Value& port)
{
    char wwn[24];
    plain_flat(wwn, sizeof wwn, port["wwn"].asCString());
    return plain_device_path(broker, "KALDERA_FCPort", host, "DeviceID", wwn);
}

} // namespace

CMPIStatus plain_enumerate_controlled_by(const CMPIBroker* broker, const CMPIResult* result,
                                         const CMPIObjectPath* cop)
{
    char host[256];
    plain_host_name(host, sizeof host);
    const char* const name_space = CMGetCharPtr(CMGetNameSpace(cop, nullptr));
    for (const controller& controller : read_controllers()) {
        CMPIObjectPath* const from =
            plain_device_path(broker, "KALDERA_PortController", host, "DeviceID", controller.id);
        plain_for_each_port_of(controller.address, [&](int, const Json::Value& port) {
            const plain_end ends[] = {{"Antecedent", from}, {"Dependent", port_path(broker, host, port)}};
            CMReturnInstance(result, plain_association(broker, name_space, "KALDERA_ControlledBy", ends));
        });
    }
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus plain_names_of_ports(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath* cop)
{
    char host[256];
    plain_host_name(host, sizeof host);
    const bool own = plain_is_device(cop, "KALDERA_PortController", host);
    const char* const wanted = plain_key(cop, "DeviceID");
    for (const controller& controller : read_controllers()) {
        const bool found = own && strcmp(controller.id, wanted) == 0;
        plain_for_each_port_of(controller.address, [&](int, const Json::Value& port) {
            if (found)
                CMReturnObjectPath(result, port_path(broker, host, port));
        });
    }
    return {CMPI_RC_OK, nullptr};
}

} // namespace KPRV::bench

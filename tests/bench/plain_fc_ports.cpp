#include "tests/bench/Plain_Provider.h"
#include "tests/bench/plain_walk.h"

#include <cstdio>
#include <cstring>

namespace KPRV::bench {

namespace {

unsigned enabled_state(int status)
{
    switch (status) {
    case 8:
        return 9;
    case 9:
        return 4;
    case 10:
        return 3;
    case 11:
        return 2;
    case 13:
        return 6;
    default:
        return 1;
    }
}

CMPIInstance* port_instance(const CMPIBroker* broker, const char* host, int number, const Json::Value& answer)
{
    constexpr CMPIUint64 GIGABIT = 1000000000;
    constexpr int UNKNOWN_SPEED = 99999;
    const int status = answer["portStatusValue"].asInt();
    const int speed = answer["operatingSpeed"].asInt();
    char wwn[24], node_wwn[24], names[64];
    plain_flat(wwn, sizeof wwn, answer["wwn"].asCString());
    plain_flat(node_wwn, sizeof node_wwn, answer["nodeWwn"].asCString());
    snprintf(names, sizeof names, "%s:%s", node_wwn, wwn);

    CMPIInstance* const instance = plain_device_instance(broker, "KALDERA_FCPort", host, wwn);
    plain_set_text(instance, "PermanentAddress", wwn);
    plain_set_text(instance, "ElementName", names);
    plain_set_text(instance, "Name", names);
    plain_set_text(instance, "Caption", answer["PortSymbolicName"].asCString());
    const CMPIValue statuses = plain_array_of(broker, unsigned(status));
    CMSetProperty(instance, "OperationalStatus", &statuses, CMPI_uint16A);
    plain_set_uint16(instance, "UsageRestriction", 3);
    plain_set_uint16(instance, "PortType", answer["portTypeMOFValue"].asInt());
    plain_set_uint16(instance, "LinkTechnology", 4);
    plain_set_uint64(instance, "Speed", speed == UNKNOWN_SPEED ? 0 : speed * GIGABIT);
    plain_set_uint64(instance, "MaxSpeed", answer["supportedPortSpeeds"][0].asInt() * GIGABIT);
    plain_set_uint64(instance, "SupportedMaximumTransmissionUnit", answer["maxFrameSize"].asInt());
    plain_set_uint16(instance, "PortNumber", number);
    plain_set_uint16(instance, "EnabledState", enabled_state(status));
    plain_set_uint16(instance, "EnabledDefault", 2);
    return instance;
}

} // namespace

CMPIStatus plain_enumerate_fc_ports(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath*)
{
    char host[256];
    plain_host_name(host, sizeof host);
    plain_for_each_port([&](int number, const Json::Value& answer) {
        CMReturnInstance(result, port_instance(broker, host, number, answer));
    });
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus plain_get_fc_port(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath* cop)
{
    char host[256];
    plain_host_name(host, sizeof host);
    if (!plain_is_device(cop, "KALDERA_FCPort", host))
        return {CMPI_RC_ERR_NOT_FOUND, nullptr};
    const char* const wanted = plain_key(cop, "DeviceID");
    // Every port is asked for, as the module does; the comparison comes before an instance is made.
    CMPIInstance* found = nullptr;
    plain_for_each_port([&](int number, const Json::Value& answer) {
        char wwn[24];
        plain_flat(wwn, sizeof wwn, answer["wwn"].asCString());
        if (!found && strcmp(wwn, wanted) == 0)
            found = port_instance(broker, host, number, answer);
    });
    return plain_return_found(result, found);
}

} // namespace KPRV::bench

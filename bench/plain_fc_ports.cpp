#include "bench/Plain_Provider.h"
#include "bench/plain_support.h"

#include <cstdio>
#include <cstring>

namespace KPRV::bench {

namespace {

struct port
{
    char wwn[24];
    char node_wwn[24];
    int number;
    const Json::Value& answer;
};

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

CMPIInstance* make_instance(const CMPIBroker* broker, const char* host, const port& port)
{
    constexpr CMPIUint64 GIGABIT = 1000000000;
    constexpr int UNKNOWN_SPEED = 99999;
    const Json::Value& answer = port.answer;
    const int status = answer["portStatusValue"].asInt();
    const int speed = answer["operatingSpeed"].asInt();

    CMPIObjectPath* const path = plain_device_path(broker, "KALDERA_FCPort", host, "DeviceID", port.wwn);
    CMPIInstance* const instance = CMNewInstance(broker, path, nullptr);
    plain_set_text(instance, "CreationClassName", "KALDERA_FCPort");
    plain_set_text(instance, "SystemCreationClassName", "KALDERA_ComputerSystem");
    plain_set_text(instance, "SystemName", host);
    plain_set_text(instance, "DeviceID", port.wwn);
    plain_set_text(instance, "PermanentAddress", port.wwn);
    char names[64];
    snprintf(names, sizeof names, "%s:%s", port.node_wwn, port.wwn);
    plain_set_text(instance, "ElementName", names);
    plain_set_text(instance, "Name", names);
    plain_set_text(instance, "Caption", answer["PortSymbolicName"].asCString());
    CMPIValue value = {};
    CMPIArray* const statuses = CMNewArray(broker, 1, CMPI_uint16, nullptr);
    value.uint16 = static_cast<CMPIUint16>(status);
    CMSetArrayElementAt(statuses, 0, &value, CMPI_uint16);
    value.array = statuses;
    CMSetProperty(instance, "OperationalStatus", &value, CMPI_uint16A);
    plain_set_uint16(instance, "UsageRestriction", 3);
    plain_set_uint16(instance, "PortType", answer["portTypeMOFValue"].asInt());
    plain_set_uint16(instance, "LinkTechnology", 4);
    plain_set_uint64(instance, "Speed", speed == UNKNOWN_SPEED ? 0 : speed * GIGABIT);
    plain_set_uint64(instance, "MaxSpeed", answer["supportedPortSpeeds"][0].asInt() * GIGABIT);
    plain_set_uint64(instance, "SupportedMaximumTransmissionUnit", answer["maxFrameSize"].asInt());
    plain_set_uint16(instance, "PortNumber", port.number);
    plain_set_uint16(instance, "EnabledState", enabled_state(status));
    plain_set_uint16(instance, "EnabledDefault", 2);
    return instance;
}

/// Calls back for each port until the callback says false.
template <class Callback>
void for_each_port(Callback callback)
{
    const Fast_Library& library = Fast_Library::get();
    const Json::Value adapters = library.get_adapters(Json::Value());
    if (plain_is_bad(adapters))
        return;
    Json::Value port_request;
    for (const Json::Value& adapter : adapters["indexStrings"]) {
        Json::Value request;
        request["indexStr"] = adapter;
        const Json::Value ports = library.get_fc_ports(request);
        if (plain_is_bad(ports))
            continue;
        int number = 0;
        for (const Json::Value& wwn : ports["indexStrings"]) {
            port_request["wwn"] = wwn;
            const Json::Value answer = library.get_port(port_request);
            if (plain_is_bad(answer))
                continue;
            port port = {{}, {}, number++, answer};
            plain_flat(port.wwn, sizeof port.wwn, answer["wwn"].asCString());
            plain_flat(port.node_wwn, sizeof port.node_wwn, answer["nodeWwn"].asCString());
            if (!callback(port))
                return;
        }
    }
}

} // namespace

CMPIStatus plain_enumerate_fc_ports(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath*)
{
    char host[256];
    plain_host_name(host, sizeof host);
    for_each_port([&](const port& port) {
        CMReturnInstance(result, make_instance(broker, host, port));
        return true;
    });
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus plain_get_fc_port(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath* cop)
{
    char host[256];
    plain_host_name(host, sizeof host);
    if (strcmp(plain_key(cop, "CreationClassName"), "KALDERA_FCPort") != 0 ||
        strcmp(plain_key(cop, "SystemCreationClassName"), "KALDERA_ComputerSystem") != 0 ||
        strcmp(plain_key(cop, "SystemName"), host) != 0)
        return {CMPI_RC_ERR_NOT_FOUND, nullptr};
    const char* const wanted = plain_key(cop, "DeviceID");
    // Every port is asked for, as the module does; the comparison comes before an instance is made.
    CMPIInstance* found = nullptr;
    for_each_port([&](const port& port) {
        if (!found && strcmp(port.wwn, wanted) == 0)
            found = make_instance(broker, host, port);
        return true;
    });
    if (!found)
        return {CMPI_RC_ERR_NOT_FOUND, nullptr};
    CMReturnInstance(result, found);
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

} // namespace KPRV::bench

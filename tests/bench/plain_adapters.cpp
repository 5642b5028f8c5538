#include "tests/bench/Plain_Provider.h"
#include "tests/bench/plain_adapter.h"
#include "tests/bench/plain_walk.h"

namespace KPRV::bench {

namespace {

constexpr const char* ADAPTER_CLASS = "KALDERA_PortController";

bool is_cna(const Json::Value& adapter)
{
    return adapter["hbaData"].isMember("hbaMAC");
}

/// Some vendors give their cards serial numbers of their own, with the part's number before it.
const char* serial_number(const Json::Value& adapter)
{
    const Json::Value& driver = adapter["driver"];
    const Json::Value& data = adapter["hbaData"];
    if (!driver.isMember("networkDriverName") && !driver.isMember("storageDriverName"))
        return "";
    std::string_view serial = plain_view(data["oemSerialNum"]);
    const std::string_view part = plain_view(data["partNum"]);
    if (serial.empty())
        return data["serialNumber"].asCString();
    if (serial.starts_with(part))
        serial.remove_prefix(part.size());
    return serial.data();
}

void flat_address(const Json::Value& adapter, char (&id)[24])
{
    const Json::Value& address = plain_adapter_address(adapter);
    plain_flat(id, sizeof id, address.isNull() ? "" : address.asCString());
}

/// Makes the instances of one request, with the arrays of the two states.
class adapter_maker
{
public:
    explicit adapter_maker(const CMPIBroker* broker)
        : _broker(broker), _in_service(broker, 11, "The adapter is in service"),
          _stopped(broker, 10, "The adapter is disabled")
    {
        plain_host_name(_host, sizeof _host);
    }

    const char* host() const { return _host; }

    CMPIInstance* make(const Json::Value& adapter, const char* id) const
    {
        const bool stopped = !adapter["hbaData"]["hbaStatus"].asBool();
        const bool cna = is_cna(adapter);
        const char* const serial = serial_number(adapter);
        const char* const kind = cna ? "Kaldera CNA" : "Kaldera FC HBA";
        const state& shown = stopped ? _stopped : _in_service;

        CMPIInstance* const instance = plain_device_instance(_broker, ADAPTER_CLASS, _host, id);
        plain_set_text(instance, "Name", serial);
        plain_set_text(instance, "ElementName", serial);
        plain_set_text(instance, "Caption", kind);
        plain_set_text(instance, "Description", kind);
        CMSetProperty(instance, "OperationalStatus", &shown.statuses, CMPI_uint16A);
        CMSetProperty(instance, "StatusDescriptions", &shown.descriptions, CMPI_stringA);
        plain_set_uint16(instance, "EnabledState", stopped ? 3 : 2);
        plain_set_uint16(instance, "ControllerType", cna ? 1 : 4);
        if (cna)
            plain_set_text(instance, "OtherControllerType", "CNA - FC and Ethernet types");
        return instance;
    }

private:
    struct state
    {
        state(const CMPIBroker* broker, unsigned status, const char* description)
            : statuses(plain_array_of(broker, status)), descriptions(plain_array_of(broker, description))
        {
        }
        CMPIValue statuses, descriptions;
    };

    const CMPIBroker* _broker;
    state _in_service, _stopped;
    char _host[256];
};

} // namespace

bool plain_has_ports(const Json::Value& adapter)
{
    return adapter["hbaData"]["portCount"].asInt() != 0;
}

const Json::Value& plain_adapter_address(const Json::Value& adapter)
{
    if (is_cna(adapter))
        return adapter["hbaData"]["hbaMAC"];
    return adapter["driver"].isMember("storageDriverName") ? adapter["hbaData"]["wwn"]
                                                           : Json::Value::nullSingleton();
}

CMPIStatus plain_enumerate_adapters(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath*)
{
    const adapter_maker maker(broker);
    plain_for_each_adapter([&](const Json::Value& adapter) {
        if (!plain_has_ports(adapter))
            return;
        char id[24];
        flat_address(adapter, id);
        CMReturnInstance(result, maker.make(adapter, id));
    });
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus plain_get_adapter(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath* cop)
{
    const adapter_maker maker(broker);
    if (!plain_is_device(cop, ADAPTER_CLASS, maker.host()))
        return {CMPI_RC_ERR_NOT_FOUND, nullptr};
    const char* const wanted = plain_key(cop, "DeviceID");
    CMPIInstance* found = nullptr;
    plain_for_each_adapter([&](const Json::Value& adapter) {
        char id[24];
        flat_address(adapter, id);
        if (!found && strcmp(id, wanted) == 0 && plain_has_ports(adapter))
            found = maker.make(adapter, id);
    });
    return plain_return_found(result, found);
}

} // namespace KPRV::bench

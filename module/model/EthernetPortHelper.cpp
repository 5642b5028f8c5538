#include "module/model/EthernetPortHelper.h"

#include "module/adapter/Ethernet_Port_Query.h"
#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"
#include "module/model/Adapter_Walk.h"
#include "module/model/Optics_Query.h"

namespace KPRV {

EthernetPortHelper::EthernetPortHelper() : _life("EthernetPortHelper", LOG_HERE) {}

EthernetPortHelper* EthernetPortHelper::getEthernetPortHelperObject()
{
    static EthernetPortHelper helper;
    return &helper;
}

Array<Instance*> EthernetPortHelper::getInstancesByClass(classId_t id, const Wanted& wanted) const
{
    LOG_SCOPE("getInstancesByClass");
    Host_Name host(64);
    return walk_adapters(LOG_HERE, [&](int adapter_id, const Json::Value& list, Fresh_Instances& instances) {
        const String address = adapter_address(LOG_HERE, list, static_cast<unsigned>(adapter_id - 1));
        if (ProviderUtil::hasEthernetPort(address))
            walk_adapter(adapter_id, id, wanted, host, instances);
        else
            LOG(INFO, "No Ethernet ports found for Adapter - %s", address.c_str());
    });
}

Array<Instance*> EthernetPortHelper::getInstancesByAdapterId(int adapter_id, classId_t id,
                                                             const Wanted& wanted) const
{
    Host_Name host(64);
    Fresh_Instances instances;
    walk_adapter(adapter_id, id, wanted, host, instances);
    return instances.release();
}

Array<Instance*> EthernetPortHelper::getEthernetPortInstancesByAdapter(const String& mac,
                                                                       const Wanted& wanted) const
{
    // The log knows it by this name.
    LOG_SCOPE("getEthernetPortInstancesByMacAddress");
    constexpr Guarded_Entry entry = {"libGetAdapterIdByPort"};
    String index;
    if (!guarded(LOG_HERE, entry, [&] { index = ProviderUtil::getIndexInColonFormat(mac); }))
        return {};
    LOG(DBG, "getEthernetPortInstancesByMacAddress invoked with MAC Address = %s", index.c_str());
    Json::Value request(Json::objectValue);
    request["indexStr"] = index.c_str();
    const Json::Value response = libGetAdapterIdByPort(request);
    if (!ProviderUtil::isValidJsonResponse(response) || !hasMember(response, "adapterId")) {
        LOG(ERR, "libGetAdapterIdByPort returns NULL.");
        return {};
    }
    int adapter_id = 0;
    if (!guarded(LOG_HERE, entry, [&] { adapter_id = asInt(response["adapterId"]); }))
        return {};
    if (adapter_id < 1) {
        LOG(WARN, "Adapter not found in the system.");
        return {};
    }
    return getInstancesByAdapterId(adapter_id, ETHERNETPORT, wanted);
}

void EthernetPortHelper::walk_adapter(int adapter_id, classId_t id, const Wanted& wanted, Host_Name& host,
                                      Fresh_Instances& instances) const
{
    LOG_SCOPE("getInstancesByAdapterId");
    const String address = ProviderUtil::getAddrByAdapterId(adapter_id);
    const Guarded_Entry entry = {"libGetEthPhyPortIndicesByAdapter", address.c_str()};
    Json::Value request(Json::objectValue), answer;
    request["indexStr"] = address.c_str();
    if (!guarded_call(LOG_HERE, entry, libGetEthPhyPortIndicesByAdapter, request, answer))
        return;
    if (!ProviderUtil::isValidJsonResponse(answer) || !hasMember(answer, "indexStrings") ||
        !isArrayOrNull(answer["indexStrings"])) {
        LOG(ERR, "libGetEthPhyPortIndicesByAdapter returns NULL.");
        return;
    }
    sint32 number = 0;
    for (const Json::Value& element : answer["indexStrings"]) {
        String mac;
        if (guarded(LOG_HERE, entry, [&] { mac = asString(element).c_str(); }))
            publish(mac, number, id, wanted, host, instances);
        number++;
    }
}

void EthernetPortHelper::publish(const String& mac, sint32 number, classId_t id, const Wanted& wanted,
                                 Host_Name& host, Fresh_Instances& instances) const
{
    Json::Value answer;
    if (getEthPortDetails(mac, answer) != 0) {
        LOG(ERR, "Unable to get Eth port data for %s", mac.c_str());
        return;
    }
    _ethPortInfo port = {};
    if (!guarded(LOG_HERE, {"libGetEthPortByEthMac", mac.c_str()},
                 [&] { fill_ethernet_port(mac.c_str(), answer, number, host, port); }))
        return;
    switch (id) {
    case ETHERNETPORT:
        port.portType = port_type(mac);
        instances.append(getEthernetPortInstance(port, wanted));
        break;
    case LANENDPOINT:
        instances.append(getLANEndpointInstance(port, wanted));
        break;
    default:
        LOG(INFO, "Unhandled class support");
    }
}

/// Asks the transceiver; 0 if there is none: an empty slot does not lose the port.
sint32 EthernetPortHelper::port_type(const String& mac) const
{
    sint32 type = 0;
    Json::Value optics;
    if (query_optics(LOG_HERE, mac, "transceiver", optics) == 0)
        guarded(LOG_HERE, {"libGetOpticsSFP", mac.c_str()},
                [&] { type = getPortType(asString(optics["transceiver"]).c_str()); });
    return type;
}

int EthernetPortHelper::getEthPortDetails(const String& mac, Json::Value& out) const
{
    return query_ethernet_port(LOG_HERE, mac, out);
}

} // namespace KPRV

// Of `EthernetPortHelper`, the instances of one Ethernet port: the port, its LAN endpoint.
#include "module/adapter/ProviderUtil.h"
#include "module/model/EthernetPortHelper.h"
#include "module/model/Instance_Building.h"
#include "module/model/Port_Status.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

#include <string_view>

namespace KPRV {

sint32 EthernetPortHelper::getPortType(const char* transceiver) const
{
    constexpr sint32 SHORT_RANGE = 108, ANY_OTHER = 105;
    // Clients know every other transceiver by one number, "10G_BASE-LR" and "10G_BASE-LRM" among them.
    return std::string_view(transceiver) == "10G_BASE-SR" ? SHORT_RANGE : ANY_OTHER;
}

KALDERA_EthernetPort* EthernetPortHelper::getEthernetPortInstance(const _ethPortInfo& port,
                                                                  const Wanted& wanted) const
{
    LOG_SCOPE("getEthernetPortInstance");
    auto instance = create_wanted(wanted, &KALDERA_EthernetPort::DeviceID, port.mac);
    if (!instance)
        return nullptr;
    set_system_keys(*instance, ETHERNETPORT, port.systemName);
    instance->DeviceID.set(port.mac);
    if (!wanted.whole())
        return instance.steal();
    instance->PermanentAddress.set(port.permanentAddress);
    instance->NetworkAddresses.set(array_of<String>({port.permanentAddress}));
    instance->LinkTechnology.set(2);
    instance->Capabilities.set(array_of<uint16>({0}));
    instance->EnabledCapabilities.set(array_of<uint16>({0}));
    instance->OperationalStatus.set(array_of({static_cast<uint16>(port.status)}));
    instance->PortType.set(static_cast<uint16>(port.portType));
    instance->ElementName.set(port.deviceName);
    instance->PortNumber.set(static_cast<uint16>(port.portNumber));
    return instance.steal();
}

KALDERA_LANEndpoint* EthernetPortHelper::getLANEndpointInstance(const _ethPortInfo& port,
                                                                const Wanted& wanted) const
{
    LOG_SCOPE("getLANEndpointInstance");
    auto instance = create_wanted(wanted, &KALDERA_LANEndpoint::Name, port.deviceName);
    if (!instance)
        return nullptr;
    set_system_keys(*instance, LANENDPOINT, port.systemName);
    instance->Name.set(port.deviceName);
    if (!wanted.whole())
        return instance.steal();
    const sint32 status = static_cast<sint32>(port.status);
    instance->ElementName.set(port.deviceName);
    instance->Description.set(port.deviceName);
    instance->LANID.set(port.deviceName);
    instance->NameFormat.set(String(port.deviceName, "_", "ETHERNET"));
    instance->ProtocolIFType.set(1);
    instance->MACAddress.set(port.mac);
    instance->MaxDataSize.set(port.mtu);
    instance->HealthState.set(health_state(status));
    instance->EnabledState.set(enabled_state(status));
    return instance.steal();
}

} // namespace KPRV

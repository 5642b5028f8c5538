// Of `PortHelper`, the instances of one FC port: port, statistics, endpoint, group, beacon.
#include "module/adapter/ProviderUtil.h"
#include "module/model/Instance_Building.h"
#include "module/model/PortHelper.h"
#include "module/model/Port_Status.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

namespace KPRV {

namespace {

String pair_of_names(const _hbaPortInfo& port)
{
    return String(port.nodeWWN, ":", port.portWWN);
}

} // namespace

KALDERA_FCPort* PortHelper::getFCPortInstance(const _hbaPortInfo& port, const Wanted& wanted) const
{
    LOG_SCOPE("getFCPortInstance");
    auto instance = create_wanted(wanted, &KALDERA_FCPort::DeviceID, port.portWWN);
    if (!instance)
        return nullptr;
    set_system_keys(*instance, FCPORT, port.systemName);
    String address = port.portWWN;
    instance->DeviceID.set(address);
    if (!wanted.whole())
        return instance.steal();
    String names = pair_of_names(port);
    instance->PermanentAddress.set(std::move(address));
    instance->ElementName.set(names);
    instance->Name.set(std::move(names));
    instance->Caption.set(port.symbolicName);
    instance->OperationalStatus.set(array_of({static_cast<uint16>(port.status)}));
    instance->UsageRestriction.set(3);
    instance->PortType.set(static_cast<uint16>(port.portType));
    instance->LinkTechnology.set(4);
    instance->Speed.set(static_cast<uint64>(port.speed));
    instance->MaxSpeed.set(static_cast<uint64>(port.maxSpeed));
    instance->SupportedMaximumTransmissionUnit.set(static_cast<uint64>(port.maxFrameSize));
    instance->PortNumber.set(static_cast<uint16>(port.portNumber));
    instance->EnabledState.set(enabled_state(port.status));
    instance->EnabledDefault.set(2);
    return instance.steal();
}

KALDERA_FCPortStatistics* PortHelper::getFCPortStatisticsInstance(const _hbaPortInfo& port,
                                                                  const prov_pport_stats_s& statistics,
                                                                  bool fcoe, const Wanted& wanted) const
{
    LOG_SCOPE("getFCPortStatisticsInstance");
    auto instance = create_wanted(wanted, &KALDERA_FCPortStatistics::InstanceID, port.portWWN);
    if (!instance)
        return nullptr;
    instance->InstanceID.set(port.portWWN);
    if (!wanted.whole())
        return instance.steal();
    instance->ElementName.set("FC Port Statistics");
    set_counters(statistics, fcoe, *instance);
    return instance.steal();
}

KALDERA_SCSIProtocolEndpoint* PortHelper::getSCSIProtocolEndpointInstance(const _hbaPortInfo& port,
                                                                          bool initiator,
                                                                          const Wanted& wanted) const
{
    LOG_SCOPE("getSCSIProtocolEndpointInstance");
    auto instance = create_wanted(wanted, &KALDERA_SCSIProtocolEndpoint::Name, port.portWWN);
    if (!instance)
        return nullptr;
    set_system_keys(*instance, SCSIPROTOCOLENDPOINT, port.systemName);
    const String address = port.portWWN;
    instance->Name.set(address);
    instance->ElementName.set(address);
    instance->Role.set(initiator ? 2 : 3);
    if (!wanted.whole())
        return instance.steal();
    instance->OperationalStatus.set(array_of({static_cast<uint16>(port.status)}));
    instance->ProtocolIFType.set(1);
    instance->OtherTypeDescription.set("SCSI");
    instance->ConnectionType.set(2);
    instance->EnabledState.set(enabled_state(port.status));
    return instance.steal();
}

KALDERA_LogicalPortGroup* PortHelper::getLogicalPortGroupInstance(const _hbaPortInfo& port,
                                                                  const Wanted& wanted) const
{
    LOG_SCOPE("getLogicalPortGroupInstance");
    auto instance = create_wanted(wanted, &KALDERA_LogicalPortGroup::InstanceID, port.nodeWWN);
    if (!instance)
        return nullptr;
    instance->InstanceID.set(port.nodeWWN);
    if (!wanted.whole())
        return instance.steal();
    instance->Name.set(port.portWWN);
    instance->NameFormat.set("WWN");
    instance->ElementName.set(pair_of_names(port));
    instance->Caption.set(port.systemName);
    instance->Description.set(port.systemName);
    return instance.steal();
}

KALDERA_AlarmDevice* PortHelper::getAlarmDeviceInstance(const _hbaPortInfo& port, bool beacon_on,
                                                        const Wanted& wanted) const
{
    LOG_SCOPE("getAlarmDeviceInstance");
    auto instance = create_wanted(wanted, &KALDERA_AlarmDevice::DeviceID, port.portWWN);
    if (!instance)
        return nullptr;
    set_system_keys(*instance, ALARMDEVICE, port.systemName);
    const String address = port.portWWN;
    instance->DeviceID.set(address);
    if (!wanted.whole())
        return instance.steal();
    instance->Description.set(port.systemName);
    instance->ElementName.set(address);
    instance->Caption.set(port.symbolicName);
    instance->Urgency.set(3);
    instance->VisibleAlarm.set(true);
    instance->AlarmState.set(beacon_on ? 3 : 1);
    return instance.steal();
}

} // namespace KPRV

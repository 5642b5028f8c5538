// Of `PortHelper`, the instances of one FC port: port, statistics, endpoint, group, beacon.
#include "module/adapter/ProviderUtil.h"
#include "module/model/Instance_Building.h"
#include "module/model/PortHelper.h"
#include "module/model/Port_Status.h"
#include "module/runtime/Ref.h"
#include "module/runtime/log.h"

namespace KPRV {

namespace {

String pair_of_names(const _hbaPortInfo& port)
{
    return String(port.nodeWWN, ":", port.portWWN);
}

} // namespace

KALDERA_FCPort* PortHelper::getFCPortInstance(const _hbaPortInfo& port) const
{
    LOG_SCOPE("getFCPortInstance");
    Ref<KALDERA_FCPort> instance(create_null<KALDERA_FCPort>());
    set_system_keys(*instance, FCPORT, port.systemName);
    String address = port.portWWN, names = pair_of_names(port);
    instance->DeviceID.set(address);
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
                                                                  bool fcoe) const
{
    LOG_SCOPE("getFCPortStatisticsInstance");
    Ref<KALDERA_FCPortStatistics> instance(create_null<KALDERA_FCPortStatistics>());
    instance->InstanceID.set(port.portWWN);
    instance->ElementName.set("FC Port Statistics");
    set_counters(statistics, fcoe, *instance);
    return instance.steal();
}

KALDERA_SCSIProtocolEndpoint* PortHelper::getSCSIProtocolEndpointInstance(const _hbaPortInfo& port,
                                                                          bool initiator) const
{
    LOG_SCOPE("getSCSIProtocolEndpointInstance");
    Ref<KALDERA_SCSIProtocolEndpoint> instance(create_null<KALDERA_SCSIProtocolEndpoint>());
    set_system_keys(*instance, SCSIPROTOCOLENDPOINT, port.systemName);
    const String address = port.portWWN;
    instance->Name.set(address);
    instance->ElementName.set(address);
    instance->OperationalStatus.set(array_of({static_cast<uint16>(port.status)}));
    instance->ProtocolIFType.set(1);
    instance->OtherTypeDescription.set("SCSI");
    instance->ConnectionType.set(2);
    instance->Role.set(initiator ? 2 : 3);
    instance->EnabledState.set(enabled_state(port.status));
    return instance.steal();
}

KALDERA_LogicalPortGroup* PortHelper::getLogicalPortGroupInstance(const _hbaPortInfo& port) const
{
    LOG_SCOPE("getLogicalPortGroupInstance");
    Ref<KALDERA_LogicalPortGroup> instance(create_null<KALDERA_LogicalPortGroup>());
    instance->InstanceID.set(port.nodeWWN);
    instance->Name.set(port.portWWN);
    instance->NameFormat.set("WWN");
    instance->ElementName.set(pair_of_names(port));
    instance->Caption.set(port.systemName);
    instance->Description.set(port.systemName);
    return instance.steal();
}

KALDERA_AlarmDevice* PortHelper::getAlarmDeviceInstance(const _hbaPortInfo& port, bool beacon_on) const
{
    LOG_SCOPE("getAlarmDeviceInstance");
    Ref<KALDERA_AlarmDevice> instance(create_null<KALDERA_AlarmDevice>());
    set_system_keys(*instance, ALARMDEVICE, port.systemName);
    instance->Description.set(port.systemName);
    const String address = port.portWWN;
    instance->DeviceID.set(address);
    instance->ElementName.set(address);
    instance->Caption.set(port.symbolicName);
    instance->Urgency.set(3);
    instance->VisibleAlarm.set(true);
    instance->AlarmState.set(beacon_on ? 3 : 1);
    return instance.steal();
}

} // namespace KPRV

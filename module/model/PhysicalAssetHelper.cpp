#include "module/model/PhysicalAssetHelper.h"

#include "module/adapter/Adapter_List.h"
#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"
#include "module/model/Fresh_Instances.h"
#include "module/model/Instance_Building.h"
#include "module/model/PortHelper.h"
#include "module/runtime/objects/Ref.h"

namespace KPRV {

PhysicalAssetHelper::PhysicalAssetHelper() : _life("PhysicalAssetHelper", LOG_HERE) {}

PhysicalAssetHelper* PhysicalAssetHelper::getPhysicalAssetHelperObject()
{
    static PhysicalAssetHelper helper;
    return &helper;
}

Array<Instance*> PhysicalAssetHelper::getInstancesByClass(classId_t id) const
{
    LOG_SCOPE("getInstancesByClass");
    Json::Value adapters;
    const int count = ProviderUtil::getNumberOfAdapters(adapters);
    if (count < 1) {
        LOG(WARN, "No adapters in the system. ");
        return {};
    }
    Fresh_Instances instances;
    for (int adapter_id = 1; adapter_id <= count; adapter_id++) {
        const String adapter = adapter_address(LOG_HERE, member(adapters, "indexStrings"),
                                               static_cast<unsigned>(adapter_id - 1));
        Json::Value details;
        if (ProviderUtil::getAdapterDetails(adapter, details) != 0) {
            // Unlike in the other walks, no later adapter is looked at.
            LOG(INFO, "Unable to get Adapter info %d - %s", adapter_id, adapter.c_str());
            break;
        }
        walk_ports(adapter_id, adapter, id, instances);
    }
    return instances.release();
}

void PhysicalAssetHelper::walk_ports(int adapter_id, const String& adapter, classId_t id,
                                     Fresh_Instances& instances) const
{
    Json::Value ports;
    if (PortHelper::getPortHelperObject()->getNumberOfPorts(adapter, ports) < 1) {
        LOG(WARN, "There are no ports associated to Adapter id %d", adapter_id);
        return;
    }
    int port_index = 0;
    for (const Json::Value& element : ports["indexStrings"])
        publish(adapter_id, port_index++, element, id, instances);
}

void PhysicalAssetHelper::publish(int adapter_id, int port_index, const Json::Value& element, classId_t id,
                                  Fresh_Instances& instances) const
{
    const PortHelper* ports = PortHelper::getPortHelperObject();
    String address;
    if (!guarded(LOG_HERE, {"libGetFcPhyPortIndicesByAdapter"}, [&] { address = asString(element).c_str(); }))
        return;
    Json::Value answer;
    if (ports->getPortDetails(address, answer) != 0)
        return;
    const int result = ports->getOpticsInfo(address, answer);
    if (result != 0) {
        LOG(WARN, "getOpticsInfo failed for PortIndex =%d Ret = %d", port_index, result);
        return;
    }
    _sfpInfo sfp = {};
    if (!guarded(LOG_HERE, {"libGetOpticsSFP", address.c_str()},
                 [&] { fill_sfp(answer, adapter_id, port_index, sfp); }))
        return;
    if (id == PHYSICALCONNECTOR)
        instances.append(getPhysicalConnectorInstance(sfp));
    else
        LOG(INFO, "Default case . Other classes ");
}

KALDERA_PhysicalConnector* PhysicalAssetHelper::getPhysicalConnectorInstance(const _sfpInfo& sfp) const
{
    LOG_SCOPE("getPhysicalConnectorInstance");
    constexpr uint16 SFP_CONNECTOR = 118;
    const char* class_name = ProviderUtil::getClassName(PHYSICALCONNECTOR);
    Ref<KALDERA_PhysicalConnector> connector(create_null<KALDERA_PhysicalConnector>());
    connector->CreationClassName.set(class_name);
    connector->Caption.set(class_name);
    connector->ElementName.set(class_name);
    connector->Tag.set(sfp.tag);
    connector->Manufacturer.set(sfp.vendorName);
    connector->PartNumber.set(sfp.vendorPart);
    connector->SerialNumber.set(sfp.serialNumber);
    connector->Model.set(sfp.extendedID);
    connector->ConnectorDescription.set(sfp.extendedID);
    connector->Version.set(sfp.revision);
    connector->Description.set(sfp.speed);
    connector->ConnectorType.set(array_of({SFP_CONNECTOR}));
    connector->ConnectorGender.set(0);
    connector->ConnectorPinout.set("0");
    connector->NumPhysicalPins.set(0);
    connector->ConnectorLayout.set(1);
    return connector.steal();
}

} // namespace KPRV

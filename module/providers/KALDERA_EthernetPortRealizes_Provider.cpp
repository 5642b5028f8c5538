#include "module/model/EthernetPortHelper.h"
#include "module/providers/connector_place.h"
#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/ports.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/CIM_PhysicalElement.h"
#include "module/schema/KALDERA_EthernetPort.h"
#include "module/schema/KALDERA_EthernetPortRealizes_Skeleton.h"
#include "module/schema/KALDERA_PhysicalConnector.h"

namespace KPRV {

class KALDERA_EthernetPortRealizes_Provider : public KALDERA_EthernetPortRealizes_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_EthernetPortRealizes*,
                                         Enum_Instances_Handler<KALDERA_EthernetPortRealizes>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_PhysicalConnector> connectors(fc_hba_instances(PHYSICALCONNECTOR));
        if (connectors.empty())
            return SAYING(WARN, "No Connector Found").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_EthernetPortRealizes::Antecedent,
                         &KALDERA_EthernetPortRealizes::Dependent);
        for (uint32 i = 0; i < connectors.size(); i++) {
            // Connectors of plain FC adapters meet an empty list and are passed over.
            const Connector_Place place(connectors[i]->Tag.value);
            List<KALDERA_EthernetPort> ports(
                EthernetPortHelper::getEthernetPortHelperObject()->getInstancesByAdapterId(place.adapter_id,
                                                                                           ETHERNETPORT));
            if (const auto* port = port_with_number(ports, place.port_number))
                pair(connectors[i], port);
        }
        return ENUM_INSTANCES_OK;
    }
};

PROVIDER_PROC(KALDERA_EthernetPortRealizes)

} // namespace KPRV

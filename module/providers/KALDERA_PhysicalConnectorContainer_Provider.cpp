#include "module/adapter/ProviderUtil.h"
#include "module/providers/connector_place.h"
#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_PhysicalElement.h"
#include "module/schema/CIM_PhysicalPackage.h"
#include "module/schema/KALDERA_PhysicalConnector.h"
#include "module/schema/KALDERA_PhysicalConnectorContainer_Skeleton.h"
#include "module/schema/KALDERA_PhysicalPackage.h"

namespace KPRV {

class KALDERA_PhysicalConnectorContainer_Provider : public KALDERA_PhysicalConnectorContainer_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_PhysicalConnectorContainer*,
                                         Enum_Instances_Handler<KALDERA_PhysicalConnectorContainer>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_PhysicalConnector> connectors(fc_hba_instances(PHYSICALCONNECTOR));
        if (connectors.empty())
            return SAYING(WARN, "No Connectors retrieved\n").answer(ENUM_INSTANCES_OK);
        List<KALDERA_PhysicalPackage> packages(fc_hba_instances(PHYSICALPACKAGE));
        if (packages.empty())
            return SAYING(WARN, "No PhysicalPackage retrieved\n").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_PhysicalConnectorContainer::GroupComponent,
                         &KALDERA_PhysicalConnectorContainer::PartComponent);
        for (uint32 i = 0; i < packages.size(); i++) {
            for (uint32 j = 0; j < connectors.size(); j++) {
                // The library is asked anew for each pair: adapters may change places between two requests.
                const String address =
                    ProviderUtil::getAddrByAdapterId(Connector_Place(connectors[j]->Tag.value).adapter_id);
                const String serial_number = ProviderUtil::getAdapterSerialNumber(address);
                // The one comparison of identifiers that minds case.
                if (serial_number == packages[i]->SerialNumber.value)
                    pair(packages[i], connectors[j]);
            }
        }
        return ENUM_INSTANCES_OK;
    }
};

PROVIDER_PROC(KALDERA_PhysicalConnectorContainer)

} // namespace KPRV

#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_Controller.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/KALDERA_EthernetPort.h"
#include "module/schema/KALDERA_EthernetPortControlledBy_Skeleton.h"
#include "module/schema/KALDERA_PortController.h"

namespace KPRV {

class KALDERA_EthernetPortControlledBy_Provider : public KALDERA_EthernetPortControlledBy_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_EthernetPortControlledBy*,
                                         Enum_Instances_Handler<KALDERA_EthernetPortControlledBy>* handler)
    {
        LOG_SCOPE("enum_instances");
        using Control = KALDERA_EthernetPortControlledBy;
        List<KALDERA_PortController> adapters(fc_hba_instances(PORTCONTROLLER, Wanted::names()));
        TRACE_BUILDING();
        const Pairs pair(handler, &Control::Antecedent, &Control::Dependent);
        for (uint32 i = 0; i < adapters.size(); i++) {
            const Wanted wanted = handler->wanted().beside<KALDERA_EthernetPort>(
                adapters[i], &Control::Antecedent, &Control::Dependent);
            List<KALDERA_EthernetPort> ports(ethernet_ports_of(adapters[i]->DeviceID.value, wanted));
            for (uint32 j = 0; j < ports.size(); j++)
                pair(adapters[i], ports[j]);
        }
        return ENUM_INSTANCES_OK;
    }
};

PROVIDER_PROC(KALDERA_EthernetPortControlledBy)

} // namespace KPRV

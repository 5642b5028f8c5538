#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_Controller.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/KALDERA_ControlledBy_Skeleton.h"
#include "module/schema/KALDERA_FCPort.h"
#include "module/schema/KALDERA_PortController.h"

namespace KPRV {

class KALDERA_ControlledBy_Provider : public KALDERA_ControlledBy_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_ControlledBy*,
                                         Enum_Instances_Handler<KALDERA_ControlledBy>* handler)
    {
        LOG_SCOPE("enum_instances");
        using Control = KALDERA_ControlledBy;
        List<KALDERA_PortController> adapters(fc_hba_instances(PORTCONTROLLER, Wanted::names()));
        TRACE_BUILDING();
        const Pairs pair(handler, &Control::Antecedent, &Control::Dependent);
        for (uint32 i = 0; i < adapters.size(); i++) {
            const Wanted wanted = handler->wanted().beside<KALDERA_FCPort>(adapters[i], &Control::Antecedent,
                                                                           &Control::Dependent);
            List<KALDERA_FCPort> ports(fc_ports_of(adapters[i]->DeviceID.value, wanted));
            for (uint32 j = 0; j < ports.size(); j++)
                pair(adapters[i], ports[j]);
        }
        return ENUM_INSTANCES_OK;
    }
};

PROVIDER_PROC(KALDERA_ControlledBy)

} // namespace KPRV

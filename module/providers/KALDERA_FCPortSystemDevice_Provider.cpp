#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/CIM_System.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_FCPort.h"
#include "module/schema/KALDERA_FCPortSystemDevice_Skeleton.h"

namespace KPRV {

class KALDERA_FCPortSystemDevice_Provider : public KALDERA_FCPortSystemDevice_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_FCPortSystemDevice*,
                                         Enum_Instances_Handler<KALDERA_FCPortSystemDevice>* handler)
    {
        LOG_SCOPE("enum_instances");
        const Wanted& wanted = handler->wanted();
        List<KALDERA_ComputerSystem> systems(fc_hba_instances(
            COMPUTERSYSTEM, wanted.end<KALDERA_ComputerSystem>(&KALDERA_FCPortSystemDevice::GroupComponent)));
        List<KALDERA_FCPort> elements(
            fc_hba_instances(FCPORT, wanted.end<KALDERA_FCPort>(&KALDERA_FCPortSystemDevice::PartComponent)));
        // Deliberately weak: only a wrong count and an empty list together fail.
        if (systems.size() != 1 && elements.empty())
            return SAYING(ERR, "Error: Invalid mapping information").answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_FCPortSystemDevice::GroupComponent,
                         &KALDERA_FCPortSystemDevice::PartComponent);
        return join_first_with_each(systems, elements, pair);
    }
};

PROVIDER_PROC(KALDERA_FCPortSystemDevice)

} // namespace KPRV

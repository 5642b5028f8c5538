#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/CIM_System.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_PortController.h"
#include "module/schema/KALDERA_PortControllerSystemDevice_Skeleton.h"

namespace KPRV {

class KALDERA_PortControllerSystemDevice_Provider : public KALDERA_PortControllerSystemDevice_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_PortControllerSystemDevice*,
                                         Enum_Instances_Handler<KALDERA_PortControllerSystemDevice>* handler)
    {
        LOG_SCOPE("enum_instances");
        const Wanted& wanted = handler->wanted();
        List<KALDERA_ComputerSystem> systems(fc_hba_instances(
            COMPUTERSYSTEM,
            wanted.end<KALDERA_ComputerSystem>(&KALDERA_PortControllerSystemDevice::GroupComponent)));
        if (systems.size() != 1)
            return SAYING(ERR, "Error: Returned instances for ComputerSystem is not 1")
                .answer(ENUM_INSTANCES_FAILED);
        List<KALDERA_PortController> elements(fc_hba_instances(
            PORTCONTROLLER,
            wanted.end<KALDERA_PortController>(&KALDERA_PortControllerSystemDevice::PartComponent)));
        if (elements.empty())
            return SAYING(ERR, "Error: Invalid mapping information").answer(ENUM_INSTANCES_OK);
        LOG(INFO, "Building and returning association instances....\n");
        const Pairs pair(handler, &KALDERA_PortControllerSystemDevice::GroupComponent,
                         &KALDERA_PortControllerSystemDevice::PartComponent);
        return join_each(systems, elements, pair);
    }
};

PROVIDER_PROC(KALDERA_PortControllerSystemDevice)

} // namespace KPRV

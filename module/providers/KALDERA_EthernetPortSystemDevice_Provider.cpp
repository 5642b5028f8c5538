#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/CIM_System.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_EthernetPort.h"
#include "module/schema/KALDERA_EthernetPortSystemDevice_Skeleton.h"

namespace KPRV {

class KALDERA_EthernetPortSystemDevice_Provider : public KALDERA_EthernetPortSystemDevice_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_EthernetPortSystemDevice*,
                                         Enum_Instances_Handler<KALDERA_EthernetPortSystemDevice>* handler)
    {
        LOG_SCOPE("enum_instances");
        const Wanted& wanted = handler->wanted();
        List<KALDERA_ComputerSystem> systems(fc_hba_instances(
            COMPUTERSYSTEM,
            wanted.end<KALDERA_ComputerSystem>(&KALDERA_EthernetPortSystemDevice::GroupComponent)));
        List<KALDERA_EthernetPort> elements(fc_hba_instances(
            ETHERNETPORT,
            wanted.end<KALDERA_EthernetPort>(&KALDERA_EthernetPortSystemDevice::PartComponent)));
        // Deliberately weak: only a wrong count and an empty list together fail.
        if (systems.size() != 1 && elements.empty())
            return SAYING(ERR, "Invalid mapping information").answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_EthernetPortSystemDevice::GroupComponent,
                         &KALDERA_EthernetPortSystemDevice::PartComponent);
        return join_first_with_each(systems, elements, pair);
    }
};

PROVIDER_PROC(KALDERA_EthernetPortSystemDevice)

} // namespace KPRV

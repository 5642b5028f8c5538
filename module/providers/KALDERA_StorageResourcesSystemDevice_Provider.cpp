#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/CIM_System.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_StorageExtent.h"
#include "module/schema/KALDERA_StorageResourcesSystemDevice_Skeleton.h"
#include "module/schema/KALDERA_TapeDrive.h"

namespace KPRV {

class KALDERA_StorageResourcesSystemDevice_Provider : public KALDERA_StorageResourcesSystemDevice_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_StorageResourcesSystemDevice*,
                   Enum_Instances_Handler<KALDERA_StorageResourcesSystemDevice>* handler)
    {
        LOG_SCOPE("enum_instances");
        using Device = KALDERA_StorageResourcesSystemDevice;
        const Wanted& wanted = handler->wanted();
        List<KALDERA_ComputerSystem> systems(
            fc_hba_instances(COMPUTERSYSTEM, wanted.end<KALDERA_ComputerSystem>(&Device::GroupComponent)));
        List<KALDERA_StorageExtent> extents(
            hdr_instances(STORAGEEXTENT, wanted.end<KALDERA_StorageExtent>(&Device::PartComponent)));
        List<KALDERA_TapeDrive> drives(
            hdr_instances(TAPEDRIVE, wanted.end<KALDERA_TapeDrive>(&Device::PartComponent)));
        TRACE_BUILDING();
        const Pairs pair(handler, &Device::GroupComponent, &Device::PartComponent);
        join_each(systems, extents, pair);
        return join_each(systems, drives, pair);
    }
};

PROVIDER_PROC(KALDERA_StorageResourcesSystemDevice)

} // namespace KPRV

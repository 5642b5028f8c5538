#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_SoftwareIdentity.h"
#include "module/schema/CIM_System.h"
#include "module/schema/KALDERA_AdapterSoftwareIdentity.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_InstalledSoftwareIdentity_Skeleton.h"

namespace KPRV {

class KALDERA_InstalledSoftwareIdentity_Provider : public KALDERA_InstalledSoftwareIdentity_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_InstalledSoftwareIdentity*,
                                         Enum_Instances_Handler<KALDERA_InstalledSoftwareIdentity>* handler)
    {
        LOG_SCOPE("enum_instances");
        const Wanted& wanted = handler->wanted();
        List<KALDERA_ComputerSystem> systems(fc_hba_instances(
            COMPUTERSYSTEM, wanted.end<KALDERA_ComputerSystem>(&KALDERA_InstalledSoftwareIdentity::System)));
        if (systems.size() != 1)
            return SAYING(ERR, "Error: count of computersystem instance is not 1")
                .answer(ENUM_INSTANCES_FAILED);
        List<KALDERA_AdapterSoftwareIdentity> elements(fc_hba_instances(
            ADAPTERSOFTWAREIDENTITY, wanted.end<KALDERA_AdapterSoftwareIdentity>(
                                         &KALDERA_InstalledSoftwareIdentity::InstalledSoftware)));
        if (elements.empty())
            return SAYING(ERR, "Error: Invalid mapping information").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_InstalledSoftwareIdentity::System,
                         &KALDERA_InstalledSoftwareIdentity::InstalledSoftware);
        return join_each(systems, elements, pair);
    }
};

PROVIDER_PROC(KALDERA_InstalledSoftwareIdentity)

} // namespace KPRV

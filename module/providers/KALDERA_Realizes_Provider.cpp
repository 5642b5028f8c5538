#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/CIM_PhysicalElement.h"
#include "module/schema/KALDERA_PhysicalPackage.h"
#include "module/schema/KALDERA_PortController.h"
#include "module/schema/KALDERA_Realizes_Skeleton.h"

namespace KPRV {

class KALDERA_Realizes_Provider : public KALDERA_Realizes_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_Realizes*,
                                         Enum_Instances_Handler<KALDERA_Realizes>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_PortController> adapters(fc_hba_instances(PORTCONTROLLER));
        List<KALDERA_PhysicalPackage> packages(fc_hba_instances(PHYSICALPACKAGE));
        if (adapters.size() != packages.size())
            return SAYING(ERR, "Error: Invalid number of instances returned!\n")
                .answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_Realizes::Antecedent, &KALDERA_Realizes::Dependent);
        // One index over both lists, not a join: a package whose adapter stands at another place gets no
        // link.
        for (uint32 i = 0; i < adapters.size(); i++) {
            if (name_eq(adapters[i]->ElementName.value.c_str(), packages[i]->SerialNumber.value.c_str()))
                pair(packages[i], adapters[i]);
        }
        return ENUM_INSTANCES_OK;
    }
};

PROVIDER_PROC(KALDERA_Realizes)

} // namespace KPRV

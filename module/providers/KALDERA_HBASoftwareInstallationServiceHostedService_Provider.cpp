#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_HBASoftwareInstallationService.h"
#include "module/schema/KALDERA_HBASoftwareInstallationServiceHostedService_Skeleton.h"

namespace KPRV {

class KALDERA_HBASoftwareInstallationServiceHostedService_Provider
    : public KALDERA_HBASoftwareInstallationServiceHostedService_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_HBASoftwareInstallationServiceHostedService*,
                   Enum_Instances_Handler<KALDERA_HBASoftwareInstallationServiceHostedService>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_ComputerSystem> systems(fc_hba_instances(COMPUTERSYSTEM));
        List<KALDERA_HBASoftwareInstallationService> elements(
            fc_hba_instances(HBASOFTWAREINSTALLATIONSERVICE));
        // Deliberately weak: only a wrong count and an empty list together fail.
        if (systems.size() != 1 && elements.empty())
            return SAYING(ERR, "Error: Invalid mapping information").answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_HBASoftwareInstallationServiceHostedService::Antecedent,
                         &KALDERA_HBASoftwareInstallationServiceHostedService::Dependent);
        return join_first_with_each(systems, elements, pair);
    }
};

PROVIDER_PROC(KALDERA_HBASoftwareInstallationServiceHostedService)

} // namespace KPRV

#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_HBASoftwareInstallationService.h"
#include "module/schema/KALDERA_HBASoftwareInstallationServiceCapabilities.h"
#include "module/schema/KALDERA_HBASoftwareInstallationServiceElementCapabilities_Skeleton.h"

namespace KPRV {

class KALDERA_HBASoftwareInstallationServiceElementCapabilities_Provider
    : public KALDERA_HBASoftwareInstallationServiceElementCapabilities_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_HBASoftwareInstallationServiceElementCapabilities*,
                   Enum_Instances_Handler<KALDERA_HBASoftwareInstallationServiceElementCapabilities>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_HBASoftwareInstallationService> services(
            fc_hba_instances(HBASOFTWAREINSTALLATIONSERVICE));
        if (services.size() != 1)
            return SAYING(ERR, "Error: Invalid mapping information for service").answer(ENUM_INSTANCES_OK);
        List<KALDERA_HBASoftwareInstallationServiceCapabilities> capabilities(
            fc_hba_instances(HBASOFTWAREINSTALLATIONSERVICECAPABILITIES));
        if (capabilities.size() != 1)
            return SAYING(ERR, "Error: Invalid mapping information for capabilities")
                .answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_HBASoftwareInstallationServiceElementCapabilities::ManagedElement,
                         &KALDERA_HBASoftwareInstallationServiceElementCapabilities::Capabilities);
        return join_each(services, capabilities, pair);
    }
};

PROVIDER_PROC(KALDERA_HBASoftwareInstallationServiceElementCapabilities)

} // namespace KPRV

#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_HBASoftwareInstallationServiceCapabilities_Skeleton.h"

namespace KPRV {

class KALDERA_HBASoftwareInstallationServiceCapabilities_Provider
    : public KALDERA_HBASoftwareInstallationServiceCapabilities_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_HBASoftwareInstallationServiceCapabilities*,
                   Enum_Instances_Handler<KALDERA_HBASoftwareInstallationServiceCapabilities>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_one(fc_hba_instances(HBASOFTWAREINSTALLATIONSERVICECAPABILITIES, handler->wanted()),
                           *handler, SAYING(ERR, "Error: Invalid mapping information"), ENUM_INSTANCES_OK);
    }
};

PROVIDER_PROC(KALDERA_HBASoftwareInstallationServiceCapabilities)

} // namespace KPRV

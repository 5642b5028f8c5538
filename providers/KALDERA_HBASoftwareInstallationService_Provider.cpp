#include "providers/deliver.h"
#include "providers/managers.h"
#include "providers/proc.h"
#include "schema/KALDERA_HBASoftwareInstallationService_Skeleton.h"

namespace KPRV {

class KALDERA_HBASoftwareInstallationService_Provider : public KALDERA_HBASoftwareInstallationService_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_HBASoftwareInstallationService*,
                   Enum_Instances_Handler<KALDERA_HBASoftwareInstallationService>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_one(fc_hba_instances(HBASOFTWAREINSTALLATIONSERVICE), *handler,
                           SAYING(ERR, "Error: Invalid mapping information"), ENUM_INSTANCES_OK);
    }
};

PROVIDER_PROC(KALDERA_HBASoftwareInstallationService)

} // namespace KPRV

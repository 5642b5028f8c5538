#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_SCSIProtocolEndpoint_Skeleton.h"

namespace KPRV {

class KALDERA_SCSIProtocolEndpoint_Provider : public KALDERA_SCSIProtocolEndpoint_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_SCSIProtocolEndpoint*,
                                         Enum_Instances_Handler<KALDERA_SCSIProtocolEndpoint>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(SCSIPROTOCOLENDPOINT, handler->wanted()), *handler,
                           SAYING(ERR, "No FC Ports Found!"));
    }
};

PROVIDER_PROC(KALDERA_SCSIProtocolEndpoint)

} // namespace KPRV

#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_EthernetPort_Skeleton.h"

namespace KPRV {

class KALDERA_EthernetPort_Provider : public KALDERA_EthernetPort_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_EthernetPort*,
                                         Enum_Instances_Handler<KALDERA_EthernetPort>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(ETHERNETPORT, handler->wanted()), *handler,
                           SAYING(ERR, "Error: Invalid mapping information"));
    }
};

PROVIDER_PROC(KALDERA_EthernetPort)

} // namespace KPRV

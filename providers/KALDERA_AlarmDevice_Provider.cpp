#include "providers/deliver.h"
#include "providers/managers.h"
#include "providers/proc.h"
#include "schema/KALDERA_AlarmDevice_Skeleton.h"

namespace KPRV {

class KALDERA_AlarmDevice_Provider : public KALDERA_AlarmDevice_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_AlarmDevice*,
                                         Enum_Instances_Handler<KALDERA_AlarmDevice>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(ALARMDEVICE), *handler,
                           SAYING(ERR, "Invalid number of Instances returned"));
    }
};

PROVIDER_PROC(KALDERA_AlarmDevice)

} // namespace KPRV

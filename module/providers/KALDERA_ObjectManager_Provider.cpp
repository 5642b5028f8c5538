#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_ObjectManager_Skeleton.h"

namespace KPRV {

class KALDERA_ObjectManager_Provider : public KALDERA_ObjectManager_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_ObjectManager*,
                                         Enum_Instances_Handler<KALDERA_ObjectManager>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(server_instances(OBJECTMANAGER), *handler, SAYING_NOTHING);
    }
};

PROVIDER_PROC(KALDERA_ObjectManager)

} // namespace KPRV

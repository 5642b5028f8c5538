#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_Namespace_Skeleton.h"

namespace KPRV {

class KALDERA_Namespace_Provider : public KALDERA_Namespace_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_Namespace*,
                                         Enum_Instances_Handler<KALDERA_Namespace>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(server_instances(NAMESPACE), *handler, SAYING_NOTHING);
    }
};

PROVIDER_PROC(KALDERA_Namespace)

} // namespace KPRV

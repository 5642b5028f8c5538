#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_Namespace.h"
#include "module/schema/KALDERA_NamespaceInManager_Skeleton.h"
#include "module/schema/KALDERA_ObjectManager.h"

namespace KPRV {

class KALDERA_NamespaceInManager_Provider : public KALDERA_NamespaceInManager_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_NamespaceInManager*,
                                         Enum_Instances_Handler<KALDERA_NamespaceInManager>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_ObjectManager> managers(server_instances(OBJECTMANAGER));
        if (managers.size() != 1)
            return SAYING(ERR, "Invalid number of ObjectManager class instances")
                .answer(ENUM_INSTANCES_FAILED);
        List<KALDERA_Namespace> name_spaces(server_instances(NAMESPACE));
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_NamespaceInManager::Antecedent,
                         &KALDERA_NamespaceInManager::Dependent);
        return join_each(managers, name_spaces, pair);
    }
};

PROVIDER_PROC(KALDERA_NamespaceInManager)

} // namespace KPRV

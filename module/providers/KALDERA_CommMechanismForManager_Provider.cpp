#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_CIMXMLCommunicationMechanism.h"
#include "module/schema/KALDERA_CommMechanismForManager_Skeleton.h"
#include "module/schema/KALDERA_ObjectManager.h"

namespace KPRV {

class KALDERA_CommMechanismForManager_Provider : public KALDERA_CommMechanismForManager_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_CommMechanismForManager*,
                                         Enum_Instances_Handler<KALDERA_CommMechanismForManager>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_ObjectManager> managers(server_instances(OBJECTMANAGER));
        if (managers.size() != 1)
            return SAYING(ERR, "Invalid number of ObjectManager instances").answer(ENUM_INSTANCES_FAILED);
        List<KALDERA_CIMXMLCommunicationMechanism> mechanisms(server_instances(CIMXMLCOMMUNICATIONMECHANISM));
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_CommMechanismForManager::Antecedent,
                         &KALDERA_CommMechanismForManager::Dependent);
        return join_each(managers, mechanisms, pair);
    }
};

PROVIDER_PROC(KALDERA_CommMechanismForManager)

} // namespace KPRV

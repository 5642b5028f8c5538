#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_CIMXMLCommunicationMechanism_Skeleton.h"

namespace KPRV {

class KALDERA_CIMXMLCommunicationMechanism_Provider : public KALDERA_CIMXMLCommunicationMechanism_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_CIMXMLCommunicationMechanism*,
                   Enum_Instances_Handler<KALDERA_CIMXMLCommunicationMechanism>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(server_instances(CIMXMLCOMMUNICATIONMECHANISM), *handler, SAYING_NOTHING);
    }
};

PROVIDER_PROC(KALDERA_CIMXMLCommunicationMechanism)

} // namespace KPRV

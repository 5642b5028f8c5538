#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_RegisteredProfile.h"
#include "module/schema/CIM_RegisteredSubProfile.h"
#include "module/schema/KALDERA_RegisteredProfile.h"
#include "module/schema/KALDERA_RegisteredSubProfile.h"
#include "module/schema/KALDERA_SubProfileRequiresProfile_Skeleton.h"

namespace KPRV {

class KALDERA_SubProfileRequiresProfile_Provider : public KALDERA_SubProfileRequiresProfile_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_SubProfileRequiresProfile*,
                                         Enum_Instances_Handler<KALDERA_SubProfileRequiresProfile>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_RegisteredProfile> profiles(server_instances(REGISTEREDPROFILE));
        List<KALDERA_RegisteredSubProfile> subprofiles(server_instances(REGISTEREDSUBPROFILE));
        if (profiles.empty() || subprofiles.empty())
            return SAYING(ERR, "Invalid number of instances").answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_SubProfileRequiresProfile::Antecedent,
                         &KALDERA_SubProfileRequiresProfile::Dependent);
        for (uint32 i = 0; i < profiles.size(); i++) {
            const Array<String> names =
                ServerManager::getServerManager()->getSubProfilesOfProfile(profiles[i]->InstanceID.value);
            for (uint32 j = 0; j < subprofiles.size(); j++) {
                // Exact, where other names are compared without case.
                if (names.find(subprofiles[j]->InstanceID.value) != NPOS)
                    pair(profiles[i], subprofiles[j]);
            }
        }
        return ENUM_INSTANCES_OK;
    }
};

PROVIDER_PROC(KALDERA_SubProfileRequiresProfile)

} // namespace KPRV

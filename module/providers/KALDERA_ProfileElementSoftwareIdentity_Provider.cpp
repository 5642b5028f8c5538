#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_ManagedElement.h"
#include "module/schema/CIM_SoftwareIdentity.h"
#include "module/schema/KALDERA_ProfileElementSoftwareIdentity_Skeleton.h"
#include "module/schema/KALDERA_ProfileSoftwareIdentity.h"
#include "module/schema/KALDERA_RegisteredProfile.h"
#include "module/schema/KALDERA_RegisteredSubProfile.h"

namespace KPRV {

class KALDERA_ProfileElementSoftwareIdentity_Provider : public KALDERA_ProfileElementSoftwareIdentity_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_ProfileElementSoftwareIdentity*,
                   Enum_Instances_Handler<KALDERA_ProfileElementSoftwareIdentity>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_ProfileSoftwareIdentity> software(server_instances(PROFILESOFTWAREIDENTITY));
        if (software.size() != 1)
            return SAYING(ERR, "Invalid number of ProfileSoftwareIdentity instances returned.")
                .answer(ENUM_INSTANCES_FAILED);
        List<KALDERA_RegisteredProfile> profiles(server_instances(REGISTEREDPROFILE));
        List<KALDERA_RegisteredSubProfile> subprofiles(server_instances(REGISTEREDSUBPROFILE));
        if (profiles.empty() || subprofiles.empty())
            return SAYING(ERR, "Invalid number of Profile instances returned.").answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        // No key is compared: the one software implements all.
        const Pairs pair(handler, &KALDERA_ProfileElementSoftwareIdentity::Antecedent,
                         &KALDERA_ProfileElementSoftwareIdentity::Dependent);
        join_each(software, profiles, pair);
        return join_each(software, subprofiles, pair);
    }
};

PROVIDER_PROC(KALDERA_ProfileElementSoftwareIdentity)

} // namespace KPRV

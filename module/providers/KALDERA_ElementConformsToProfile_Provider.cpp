#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_ManagedElement.h"
#include "module/schema/CIM_RegisteredProfile.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_ElementConformsToProfile_Skeleton.h"
#include "module/schema/KALDERA_ObjectManager.h"
#include "module/schema/KALDERA_RegisteredProfile.h"
#include "module/schema/KALDERA_RegisteredSubProfile.h"

namespace KPRV {

namespace {

/// The element that a profile describes.
struct Conformance
{
    const char* profile; ///< `InstanceID`, in any case.
    classId_t element;
    const char* absent; ///< What is said when there is not exactly one such element.
};

// clang-format off
constexpr Conformance conformances[] = {
//   profile                       element          said without it
    {"FC HBA",                     COMPUTERSYSTEM,  "Invalid number of ComputerSystem class instances"},
    {"Host Discovered Resources",  COMPUTERSYSTEM,  "Invalid number of ComputerSystem class instances"},
    {"Storage HBA",                COMPUTERSYSTEM,  "Invalid number of ComputerSystem class instances"},
    {"Server",                     OBJECTMANAGER,   "Invalid number of ObjectManager class instances"},
};
// clang-format on

/// Null for a profile that describes no element of its own: the standard as such.
const Conformance* conformance_of(const KALDERA_RegisteredProfile* profile)
{
    for (const Conformance& row : conformances) {
        if (profile->InstanceID.value.equali(row.profile))
            return &row;
    }
    return nullptr;
}

bool is_standard(const KALDERA_RegisteredProfile* profile)
{
    return profile->RegisteredName.value.equali("SMI-S");
}

template <class T>
const T* only(const List<T>& list)
{
    return list.size() == 1 ? list[0] : nullptr;
}

} // namespace

/// One enumeration gives three kinds of links: profiles and their elements, the standard and its profiles,
/// the standard and its subprofiles.
class KALDERA_ElementConformsToProfile_Provider : public KALDERA_ElementConformsToProfile_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_ElementConformsToProfile*,
                                         Enum_Instances_Handler<KALDERA_ElementConformsToProfile>* handler)
    {
        LOG_SCOPE("enum_instances");
        const Pairs pair(handler, &KALDERA_ElementConformsToProfile::ConformantStandard,
                         &KALDERA_ElementConformsToProfile::ManagedElement);
        List<KALDERA_RegisteredProfile> profiles(server_instances(REGISTEREDPROFILE));
        if (profiles.empty())
            return SAYING(ERR, "Error: No instances of RegisteredProfile class returned.")
                .answer(ENUM_INSTANCES_FAILED);
        link_elements(profiles, pair);

        const KALDERA_RegisteredProfile* standard = nullptr;
        for (uint32 i = 0; i < profiles.size() && !standard; i++)
            standard = is_standard(profiles[i]) ? profiles[i] : nullptr;
        // The links to the elements have gone out by now.
        if (!standard)
            return SAYING(ERR, "No instances representing SMI-S standard is returned")
                .answer(ENUM_INSTANCES_FAILED);
        for (uint32 i = 0; i < profiles.size(); i++) {
            if (!is_standard(profiles[i]))
                pair(standard, profiles[i]);
        }
        List<KALDERA_RegisteredSubProfile> subprofiles(server_instances(REGISTEREDSUBPROFILE));
        for (uint32 i = 0; i < subprofiles.size(); i++)
            pair(standard, subprofiles[i]);
        return ENUM_INSTANCES_OK;
    }

private:
    template <class Pair>
    static void link_elements(const List<KALDERA_RegisteredProfile>& profiles, const Pair& pair)
    {
        const List<KALDERA_ComputerSystem> systems(fc_hba_instances(COMPUTERSYSTEM));
        const List<KALDERA_ObjectManager> managers(server_instances(OBJECTMANAGER));
        for (uint32 i = 0; i < profiles.size(); i++) {
            LOG(INFO, "Building association instance for profile : %s",
                profiles[i]->InstanceID.value.c_str());
            const Conformance* row = conformance_of(profiles[i]);
            if (!row)
                continue;
            const Instance* element =
                row->element == COMPUTERSYSTEM ? static_cast<const Instance*>(only(systems)) : only(managers);
            if (element)
                pair(profiles[i], element);
            else
                LOG(ERR, "%s", row->absent);
        }
    }
};

PROVIDER_PROC(KALDERA_ElementConformsToProfile)

} // namespace KPRV

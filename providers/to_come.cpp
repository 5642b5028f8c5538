#include "providers/proc.h"
#include "schema/KALDERA_CommMechHostedAccessPoint_Skeleton.h"
#include "schema/KALDERA_CommMechanismForManager_Skeleton.h"
#include "schema/KALDERA_ElementConformsToProfile_Skeleton.h"
#include "schema/KALDERA_NamespaceInManager_Skeleton.h"
#include "schema/KALDERA_ObjectManagerHostedService_Skeleton.h"
#include "schema/KALDERA_ProfileElementSoftwareIdentity_Skeleton.h"
#include "schema/KALDERA_SubProfileRequiresProfile_Skeleton.h"

// Classes that are registered, so that a server finds them, and have no body yet: their associations
// enumerate nothing.

namespace KPRV {

#define WITHOUT_BODY(Class)                                                                                  \
    class Class##_Provider : public Class##_Skeleton                                                         \
    {                                                                                                        \
    };                                                                                                       \
    PROVIDER_PROC(Class)

WITHOUT_BODY(KALDERA_CommMechHostedAccessPoint)
WITHOUT_BODY(KALDERA_CommMechanismForManager)
WITHOUT_BODY(KALDERA_ElementConformsToProfile)
WITHOUT_BODY(KALDERA_NamespaceInManager)
WITHOUT_BODY(KALDERA_ObjectManagerHostedService)
WITHOUT_BODY(KALDERA_ProfileElementSoftwareIdentity)
WITHOUT_BODY(KALDERA_SubProfileRequiresProfile)

} // namespace KPRV

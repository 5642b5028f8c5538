#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_DiagnosticElementSoftwareIdentity_Skeleton.h"
#include "module/schema/KALDERA_DiagnosticSoftwareIdentity.h"
#include "module/schema/KALDERA_DiagnosticTest.h"

namespace KPRV {

class KALDERA_DiagnosticElementSoftwareIdentity_Provider
    : public KALDERA_DiagnosticElementSoftwareIdentity_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_DiagnosticElementSoftwareIdentity*,
                   Enum_Instances_Handler<KALDERA_DiagnosticElementSoftwareIdentity>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_DiagnosticSoftwareIdentity> software(fc_hba_instances(DIAGNOSTICSOFTWAREIDENTITY));
        if (software.empty())
            return SAYING(WARN, "No diagnostic softwares are installed.").answer(ENUM_INSTANCES_OK);
        if (software.size() != 1)
            return SAYING(ERR, "Error: Invalid number of instances.").answer(ENUM_INSTANCES_FAILED);
        List<KALDERA_DiagnosticTest> tests(FCHBAManager::getFCHBAManager()->getAllDiagnosticTestInstances());
        if (tests.empty())
            return SAYING(WARN, "No diagnostic services are available.").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_DiagnosticElementSoftwareIdentity::Antecedent,
                         &KALDERA_DiagnosticElementSoftwareIdentity::Dependent);
        return join_each(software, tests, pair);
    }
};

PROVIDER_PROC(KALDERA_DiagnosticElementSoftwareIdentity)

} // namespace KPRV

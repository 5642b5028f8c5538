#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/providers/token.h"
#include "module/schema/KALDERA_ConcreteJob.h"
#include "module/schema/KALDERA_DiagnosticTest.h"
#include "module/schema/KALDERA_OwningJobElement_Skeleton.h"

namespace KPRV {

/// Room for the bytes of a job's id that are looked at, and a final zero; its form is test name, "-", job
/// number.
static constexpr uint32 JOB_ID_ROOM = 128 + 1;

class KALDERA_OwningJobElement_Provider : public KALDERA_OwningJobElement_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_OwningJobElement*,
                                         Enum_Instances_Handler<KALDERA_OwningJobElement>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_ConcreteJob> jobs(fc_hba_instances(CONCRETEJOB));
        if (jobs.empty())
            return SAYING(INFO, "No jobs are currently running in the system.").answer(ENUM_INSTANCES_OK);
        List<KALDERA_DiagnosticTest> tests(FCHBAManager::getFCHBAManager()->getAllDiagnosticTestInstances());
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_OwningJobElement::OwningElement,
                         &KALDERA_OwningJobElement::OwnedElement);
        for (uint32 i = 0; i < jobs.size(); i++) {
            const String& id = jobs[i]->InstanceID.value;
            const String name = first_token(id, '-', JOB_ID_ROOM);
            for (uint32 j = 0; j < tests.size(); j++) {
                if (name.empty()) {
                    LOG(INFO, "Unable to fetch Test Name form Job instance id : %s", id.c_str());
                } else if (name_eq(name.c_str(), tests[j]->Name.value.c_str())) {
                    pair(tests[j], jobs[i]);
                    break;
                }
            }
        }
        return ENUM_INSTANCES_OK;
    }
};

PROVIDER_PROC(KALDERA_OwningJobElement)

} // namespace KPRV

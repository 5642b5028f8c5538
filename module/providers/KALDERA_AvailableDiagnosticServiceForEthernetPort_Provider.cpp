#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_AvailableDiagnosticServiceForEthernetPort_Skeleton.h"
#include "module/schema/KALDERA_DiagnosticTest.h"
#include "module/schema/KALDERA_EthernetPort.h"

namespace KPRV {

class KALDERA_AvailableDiagnosticServiceForEthernetPort_Provider
    : public KALDERA_AvailableDiagnosticServiceForEthernetPort_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_AvailableDiagnosticServiceForEthernetPort*,
                   Enum_Instances_Handler<KALDERA_AvailableDiagnosticServiceForEthernetPort>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_EthernetPort> ports(fc_hba_instances(ETHERNETPORT));
        if (ports.empty())
            return SAYING(WARN, "No ethernet ports are present for running dianostics.")
                .answer(ENUM_INSTANCES_OK);
        List<KALDERA_DiagnosticTest> tests(
            FCHBAManager::getFCHBAManager()->getDiagnosticServicesForEthernetPort());
        if (tests.empty())
            return SAYING(WARN, "No diagnostic tests are available.").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_AvailableDiagnosticServiceForEthernetPort::ServiceProvided,
                         &KALDERA_AvailableDiagnosticServiceForEthernetPort::UserOfService);
        return join_each(ports, tests,
                         [&](const Instance* element, const Instance* test) { pair(test, element); });
    }
};

PROVIDER_PROC(KALDERA_AvailableDiagnosticServiceForEthernetPort)

} // namespace KPRV

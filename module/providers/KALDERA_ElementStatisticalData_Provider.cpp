#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_ManagedElement.h"
#include "module/schema/CIM_StatisticalData.h"
#include "module/schema/KALDERA_ElementStatisticalData_Skeleton.h"
#include "module/schema/KALDERA_FCPort.h"
#include "module/schema/KALDERA_FCPortStatistics.h"

namespace KPRV {

class KALDERA_ElementStatisticalData_Provider : public KALDERA_ElementStatisticalData_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_ElementStatisticalData*,
                                         Enum_Instances_Handler<KALDERA_ElementStatisticalData>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_FCPort> ports(fc_hba_instances(FCPORT));
        if (ports.empty())
            return SAYING(WARN, "No FC Ports Found").answer(ENUM_INSTANCES_OK);
        List<KALDERA_FCPortStatistics> statistics(fc_hba_instances(FCPORTSTATISTICS));
        if (statistics.empty())
            return SAYING(WARN, "Invalid number of Port Statistice Instances!").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_ElementStatisticalData::ManagedElement,
                         &KALDERA_ElementStatisticalData::Stats);
        return join_equal(Matches::ALL, ports, &KALDERA_FCPort::DeviceID, statistics,
                          &KALDERA_FCPortStatistics::InstanceID,
                          [&](const KALDERA_FCPort* port, const KALDERA_FCPortStatistics* statistic) {
                              pair(port, statistic);
                          });
    }
};

PROVIDER_PROC(KALDERA_ElementStatisticalData)

} // namespace KPRV

#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_AlarmDevice.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/KALDERA_AlarmDevice.h"
#include "module/schema/KALDERA_AssociatedAlarm_Skeleton.h"
#include "module/schema/KALDERA_FCPort.h"

namespace KPRV {

class KALDERA_AssociatedAlarm_Provider : public KALDERA_AssociatedAlarm_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_AssociatedAlarm*,
                                         Enum_Instances_Handler<KALDERA_AssociatedAlarm>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_FCPort> ports(fc_hba_instances(FCPORT));
        if (ports.empty())
            return SAYING(WARN, "No FC Ports Found!").answer(ENUM_INSTANCES_OK);
        List<KALDERA_AlarmDevice> alarms(fc_hba_instances(ALARMDEVICE));
        if (alarms.empty())
            return SAYING(WARN, "Invalid number of Instances!").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_AssociatedAlarm::Antecedent, &KALDERA_AssociatedAlarm::Dependent);
        return join_equal(
            Matches::ALL, ports, &KALDERA_FCPort::DeviceID, alarms, &KALDERA_AlarmDevice::DeviceID,
            [&](const KALDERA_FCPort* port, const KALDERA_AlarmDevice* alarm) { pair(alarm, port); });
    }
};

PROVIDER_PROC(KALDERA_AssociatedAlarm)

} // namespace KPRV

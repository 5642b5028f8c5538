#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/CIM_ServiceAccessPoint.h"
#include "module/schema/KALDERA_DeviceSAPImplementation_Skeleton.h"
#include "module/schema/KALDERA_FCPort.h"
#include "module/schema/KALDERA_SCSIProtocolEndpoint.h"

namespace KPRV {

class KALDERA_DeviceSAPImplementation_Provider : public KALDERA_DeviceSAPImplementation_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_DeviceSAPImplementation*,
                                         Enum_Instances_Handler<KALDERA_DeviceSAPImplementation>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_SCSIProtocolEndpoint> endpoints(fc_hba_instances(SCSIPROTOCOLENDPOINT));
        if (endpoints.empty())
            return SAYING(ERR, "Error: Invalid number of instances returned").answer(ENUM_INSTANCES_OK);
        List<KALDERA_FCPort> ports(fc_hba_instances(FCPORT));
        if (ports.empty())
            return SAYING(ERR, "Error: No FCPort found!").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_DeviceSAPImplementation::Antecedent,
                         &KALDERA_DeviceSAPImplementation::Dependent);
        return join_equal(Matches::FIRST, ports, &KALDERA_FCPort::DeviceID, endpoints,
                          &KALDERA_SCSIProtocolEndpoint::Name,
                          [&](const KALDERA_FCPort* port, const KALDERA_SCSIProtocolEndpoint* endpoint) {
                              pair(port, endpoint);
                          });
    }
};

PROVIDER_PROC(KALDERA_DeviceSAPImplementation)

} // namespace KPRV

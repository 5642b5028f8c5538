#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_LogicalDevice.h"
#include "module/schema/CIM_ServiceAccessPoint.h"
#include "module/schema/KALDERA_EthernetPort.h"
#include "module/schema/KALDERA_LANEndpoint.h"
#include "module/schema/KALDERA_LANEndpointDeviceSAPImplementation_Skeleton.h"

namespace KPRV {

class KALDERA_LANEndpointDeviceSAPImplementation_Provider
    : public KALDERA_LANEndpointDeviceSAPImplementation_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_LANEndpointDeviceSAPImplementation*,
                   Enum_Instances_Handler<KALDERA_LANEndpointDeviceSAPImplementation>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_EthernetPort> ports(fc_hba_instances(ETHERNETPORT));
        if (ports.empty())
            return SAYING(WARN, "No Ethernet Port Found").answer(ENUM_INSTANCES_OK);
        List<KALDERA_LANEndpoint> endpoints(fc_hba_instances(LANENDPOINT));
        if (endpoints.empty())
            return SAYING(WARN, "Invalid number of EndPoint instances ").answer(ENUM_INSTANCES_OK);
        if (ports.size() != endpoints.size())
            return SAYING(ERR, "Error: Invalid mapping information!").answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_LANEndpointDeviceSAPImplementation::Antecedent,
                         &KALDERA_LANEndpointDeviceSAPImplementation::Dependent);
        return join_equal(Matches::FIRST, ports, &KALDERA_EthernetPort::DeviceID, endpoints,
                          &KALDERA_LANEndpoint::MACAddress,
                          [&](const KALDERA_EthernetPort* port, const KALDERA_LANEndpoint* endpoint) {
                              pair(port, endpoint);
                          });
    }
};

PROVIDER_PROC(KALDERA_LANEndpointDeviceSAPImplementation)

} // namespace KPRV

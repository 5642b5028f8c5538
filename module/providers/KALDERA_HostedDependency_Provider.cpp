#include "module/providers/controller_type.h"
#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/ports.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_ManagedElement.h"
#include "module/schema/KALDERA_EthernetPort.h"
#include "module/schema/KALDERA_FCPort.h"
#include "module/schema/KALDERA_HostedDependency_Skeleton.h"
#include "module/schema/KALDERA_PortController.h"

namespace KPRV {

class KALDERA_HostedDependency_Provider : public KALDERA_HostedDependency_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_HostedDependency*,
                                         Enum_Instances_Handler<KALDERA_HostedDependency>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_PortController> adapters(fc_hba_instances(PORTCONTROLLER));
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_HostedDependency::Antecedent,
                         &KALDERA_HostedDependency::Dependent);
        for (uint32 i = 0; i < adapters.size(); i++) {
            // A plain FC adapter has no Ethernet side.
            if (adapters[i]->ControllerType.value == CONTROLLER_FC)
                continue;
            const String& address = adapters[i]->DeviceID.value;
            List<KALDERA_FCPort> fc_ports(fc_ports_of(address));
            if (fc_ports.empty()) {
                LOG(INFO, "There are no FCPORT instances returned");
                continue;
            }
            List<KALDERA_EthernetPort> ethernet_ports(ethernet_ports_of(address));
            if (ethernet_ports.empty()) {
                LOG(INFO, "There are no ETHPORT instances returned");
                continue;
            }
            for (uint32 j = 0; j < fc_ports.size(); j++) {
                if (const auto* partner = port_with_number(ethernet_ports, fc_ports[j]->PortNumber.value))
                    pair(partner, fc_ports[j]);
            }
        }
        return ENUM_INSTANCES_OK;
    }
};

PROVIDER_PROC(KALDERA_HostedDependency)

} // namespace KPRV

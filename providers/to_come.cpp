#include "providers/proc.h"
#include "schema/KALDERA_AdapterElementSoftwareIdentity_Skeleton.h"
#include "schema/KALDERA_AffectedJobElement_Skeleton.h"
#include "schema/KALDERA_AlertIndication_Skeleton.h"
#include "schema/KALDERA_AssociatedAlarm_Skeleton.h"
#include "schema/KALDERA_AvailableDiagnosticServiceForAdapter_Skeleton.h"
#include "schema/KALDERA_AvailableDiagnosticServiceForEthernetPort_Skeleton.h"
#include "schema/KALDERA_AvailableDiagnosticServiceForFCPort_Skeleton.h"
#include "schema/KALDERA_CommMechHostedAccessPoint_Skeleton.h"
#include "schema/KALDERA_CommMechanismForManager_Skeleton.h"
#include "schema/KALDERA_CompletionRecordAppliesToElement_Skeleton.h"
#include "schema/KALDERA_ControlledBy_Skeleton.h"
#include "schema/KALDERA_DeviceSAPImplementation_Skeleton.h"
#include "schema/KALDERA_DiagnosticElementSoftwareIdentity_Skeleton.h"
#include "schema/KALDERA_ElementConformsToProfile_Skeleton.h"
#include "schema/KALDERA_ElementStatisticalData_Skeleton.h"
#include "schema/KALDERA_EthernetPortControlledBy_Skeleton.h"
#include "schema/KALDERA_EthernetPortRealizes_Skeleton.h"
#include "schema/KALDERA_EthernetPortSystemDevice_Skeleton.h"
#include "schema/KALDERA_FCPortSystemDevice_Skeleton.h"
#include "schema/KALDERA_HBASoftwareInstallationServiceElementCapabilities_Skeleton.h"
#include "schema/KALDERA_HBASoftwareInstallationServiceHostedService_Skeleton.h"
#include "schema/KALDERA_HostedAccessPoint_Skeleton.h"
#include "schema/KALDERA_HostedCollection_Skeleton.h"
#include "schema/KALDERA_HostedDependency_Skeleton.h"
#include "schema/KALDERA_HostedLANEndpoint_Skeleton.h"
#include "schema/KALDERA_InstalledSoftwareIdentity_Skeleton.h"
#include "schema/KALDERA_LANEndpointDeviceSAPImplementation_Skeleton.h"
#include "schema/KALDERA_MemberOfCollection_Skeleton.h"
#include "schema/KALDERA_NamespaceInManager_Skeleton.h"
#include "schema/KALDERA_ObjectManagerHostedService_Skeleton.h"
#include "schema/KALDERA_OwningJobElement_Skeleton.h"
#include "schema/KALDERA_PhysicalConnectorContainer_Skeleton.h"
#include "schema/KALDERA_PortControllerSystemDevice_Skeleton.h"
#include "schema/KALDERA_ProductElementComponent_Skeleton.h"
#include "schema/KALDERA_ProductPhysicalComponent_Skeleton.h"
#include "schema/KALDERA_ProfileElementSoftwareIdentity_Skeleton.h"
#include "schema/KALDERA_Realizes_Skeleton.h"
#include "schema/KALDERA_RemoteServiceHostedAccessPoint_Skeleton.h"
#include "schema/KALDERA_SCSIInitiatorTargetLogicalUnitPath_Skeleton.h"
#include "schema/KALDERA_ServiceRecordAppliesToElement_Skeleton.h"
#include "schema/KALDERA_StorageResourcesSystemDevice_Skeleton.h"
#include "schema/KALDERA_SubProfileRequiresProfile_Skeleton.h"

// Classes that are registered, so that a server finds them, and have no instances yet.

namespace KPRV {

#define EMPTY_ASSOCIATION(Class)                                                                             \
    class Class##_Provider : public Class##_Skeleton                                                         \
    {                                                                                                        \
    public:                                                                                                  \
        Enum_Instances_Status enum_instances(const Class*, Enum_Instances_Handler<Class>*)                   \
        {                                                                                                    \
            return ENUM_INSTANCES_OK;                                                                        \
        }                                                                                                    \
    };                                                                                                       \
    PROVIDER_PROC(Class)

EMPTY_ASSOCIATION(KALDERA_AdapterElementSoftwareIdentity)
EMPTY_ASSOCIATION(KALDERA_AffectedJobElement)
EMPTY_ASSOCIATION(KALDERA_AssociatedAlarm)
EMPTY_ASSOCIATION(KALDERA_AvailableDiagnosticServiceForAdapter)
EMPTY_ASSOCIATION(KALDERA_AvailableDiagnosticServiceForEthernetPort)
EMPTY_ASSOCIATION(KALDERA_AvailableDiagnosticServiceForFCPort)
EMPTY_ASSOCIATION(KALDERA_CommMechHostedAccessPoint)
EMPTY_ASSOCIATION(KALDERA_CommMechanismForManager)
EMPTY_ASSOCIATION(KALDERA_CompletionRecordAppliesToElement)
EMPTY_ASSOCIATION(KALDERA_ControlledBy)
EMPTY_ASSOCIATION(KALDERA_DeviceSAPImplementation)
EMPTY_ASSOCIATION(KALDERA_DiagnosticElementSoftwareIdentity)
EMPTY_ASSOCIATION(KALDERA_ElementConformsToProfile)
EMPTY_ASSOCIATION(KALDERA_ElementStatisticalData)
EMPTY_ASSOCIATION(KALDERA_EthernetPortControlledBy)
EMPTY_ASSOCIATION(KALDERA_EthernetPortRealizes)
EMPTY_ASSOCIATION(KALDERA_EthernetPortSystemDevice)
EMPTY_ASSOCIATION(KALDERA_FCPortSystemDevice)
EMPTY_ASSOCIATION(KALDERA_HBASoftwareInstallationServiceElementCapabilities)
EMPTY_ASSOCIATION(KALDERA_HBASoftwareInstallationServiceHostedService)
EMPTY_ASSOCIATION(KALDERA_HostedAccessPoint)
EMPTY_ASSOCIATION(KALDERA_HostedCollection)
EMPTY_ASSOCIATION(KALDERA_HostedDependency)
EMPTY_ASSOCIATION(KALDERA_HostedLANEndpoint)
EMPTY_ASSOCIATION(KALDERA_InstalledSoftwareIdentity)
EMPTY_ASSOCIATION(KALDERA_LANEndpointDeviceSAPImplementation)
EMPTY_ASSOCIATION(KALDERA_MemberOfCollection)
EMPTY_ASSOCIATION(KALDERA_NamespaceInManager)
EMPTY_ASSOCIATION(KALDERA_ObjectManagerHostedService)
EMPTY_ASSOCIATION(KALDERA_OwningJobElement)
EMPTY_ASSOCIATION(KALDERA_PhysicalConnectorContainer)
EMPTY_ASSOCIATION(KALDERA_PortControllerSystemDevice)
EMPTY_ASSOCIATION(KALDERA_ProductElementComponent)
EMPTY_ASSOCIATION(KALDERA_ProductPhysicalComponent)
EMPTY_ASSOCIATION(KALDERA_ProfileElementSoftwareIdentity)
EMPTY_ASSOCIATION(KALDERA_Realizes)
EMPTY_ASSOCIATION(KALDERA_RemoteServiceHostedAccessPoint)
EMPTY_ASSOCIATION(KALDERA_SCSIInitiatorTargetLogicalUnitPath)
EMPTY_ASSOCIATION(KALDERA_ServiceRecordAppliesToElement)
EMPTY_ASSOCIATION(KALDERA_StorageResourcesSystemDevice)
EMPTY_ASSOCIATION(KALDERA_SubProfileRequiresProfile)

/// Refuses subscriptions: there is no event to tell of yet.
class KALDERA_AlertIndication_Provider : public KALDERA_AlertIndication_Skeleton
{
public:
    Enable_Indications_Status enable_indications(Indication_Handler<KALDERA_AlertIndication>* handler)
    {
        delete handler;
        return ENABLE_INDICATIONS_FAILED;
    }
    Disable_Indications_Status disable_indications() { return DISABLE_INDICATIONS_FAILED; }
};
PROVIDER_PROC(KALDERA_AlertIndication)

} // namespace KPRV

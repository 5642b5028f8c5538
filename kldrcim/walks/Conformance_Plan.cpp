#include "kldrcim/walks/Conformance_Plan.h"

namespace KPRV::kldrcim {

namespace {

const char* const software_properties = "InstanceID VersionString Manufacturer Classifications";
const char* const profile_properties =
    "InstanceID RegisteredName RegisteredVersion RegisteredOrganization AdvertiseTypes";

// As profiles name them.
const char* const conforms = "CIM_ElementConformsToProfile";
const char* const requires_profile = "CIM_SubProfileRequiresProfile";
const char* const software_of = "CIM_ElementSoftwareIdentity";

} // namespace

// The Storage HBA profile models an HBA by its port controller, in the scope of the host's computer system;
// FC ports come with its initiator port subprofiles. What the profile leaves to the implementation may be
// missing.
// clang-format off
const Conformance_Step conformance_steps[] = {
//   section     name                      from                    association                               near role             far role             class                                          least  most  properties
    {"Profiles", "SMI-S",                  nullptr,                nullptr,                                  nullptr,              nullptr,             "CIM_RegisteredProfile",                       1,     1,    profile_properties},
    {nullptr,    "Storage HBA",            nullptr,                nullptr,                                  nullptr,              nullptr,             "CIM_RegisteredProfile",                       1,     1,    profile_properties},
    {nullptr,    "Server",                 nullptr,                nullptr,                                  nullptr,              nullptr,             "CIM_RegisteredProfile",                       1,     1,    profile_properties},
    {nullptr,    "profiles of SMI-S",      "SMI-S",                conforms,                                 "ConformantStandard", "ManagedElement",    "CIM_RegisteredProfile",                       1,     MANY, profile_properties},
    {nullptr,    "subprofiles",            "Storage HBA",          requires_profile,                         "Antecedent",         "Dependent",         "CIM_RegisteredSubProfile",                    1,     MANY, profile_properties},
    {nullptr,    "implementation",         "Storage HBA",          software_of,                              "Dependent",          "Antecedent",        "CIM_SoftwareIdentity",                        1,     MANY, software_properties},

    {"Server",   "object manager",         "Server",               conforms,                                 "ConformantStandard", "ManagedElement",    "CIM_ObjectManager",                           1,     1,    "Name ElementName Started OperationalStatus"},
    {nullptr,    "namespaces",             "object manager",       "CIM_NamespaceInManager",                 "Antecedent",         "Dependent",         "CIM_Namespace",                               1,     MANY, "Name ClassInfo"},
    {nullptr,    "communication",          "object manager",       "CIM_CommMechanismForManager",            "Antecedent",         "Dependent",         "CIM_ObjectManagerCommunicationMechanism",     1,     MANY, "Name CommunicationMechanism FunctionalProfilesSupported"},
    {nullptr,    "host of the manager",    "object manager",       "CIM_HostedService",                      "Dependent",          "Antecedent",        "CIM_System",                                  1,     1,    "Name"},

    {"Host",     "host",                   "Storage HBA",          conforms,                                 "ConformantStandard", "ManagedElement",    "CIM_ComputerSystem",                          1,     1,    "Name NameFormat ElementName Dedicated OperationalStatus"},
    {nullptr,    "installed software",     "host",                 "CIM_InstalledSoftwareIdentity",          "System",             "InstalledSoftware", "CIM_SoftwareIdentity",                        1,     MANY, software_properties},
    {nullptr,    "access points",          "host",                 "CIM_HostedAccessPoint",                  "Antecedent",         "Dependent",         "CIM_RemoteServiceAccessPoint",                0,     MANY, "Name AccessInfo InfoFormat"},
    {nullptr,    "installation service",   "host",                 "CIM_HostedService",                      "Antecedent",         "Dependent",         "CIM_SoftwareInstallationService",             0,     MANY, "Name"},
    {nullptr,    "its capabilities",       "installation service", "CIM_ElementCapabilities",                "ManagedElement",     "Capabilities",      "CIM_SoftwareInstallationServiceCapabilities", 1,     1,    "InstanceID SupportedURISchemes"},

    {"Adapters", "adapters",               "host",                 "CIM_SystemDevice",                       "GroupComponent",     "PartComponent",     "CIM_PortController",                          1,     MANY, "DeviceID ElementName ControllerType OperationalStatus"},
    {nullptr,    "software",               "adapters",             software_of,                              "Dependent",          "Antecedent",        "CIM_SoftwareIdentity",                        1,     MANY, software_properties},
    {nullptr,    "cards",                  "adapters",             "CIM_Realizes",                           "Dependent",          "Antecedent",        "CIM_PhysicalPackage",                         1,     MANY, "Tag Manufacturer Model"},
    {nullptr,    "products",               "cards",                "CIM_ProductPhysicalComponent",           "PartComponent",      "GroupComponent",    "CIM_Product",                                 1,     1,    "Name IdentifyingNumber Vendor Version ElementName"},
    {nullptr,    "diagnostic tests",       "adapters",             "CIM_AvailableDiagnosticService",         "UserOfService",      "ServiceProvided",   "CIM_DiagnosticTest",                          0,     MANY, "Name"},

    {"FC ports", "FC ports",               "adapters",             "CIM_ControlledBy",                       "Antecedent",         "Dependent",         "CIM_FCPort",                                  1,     MANY, "DeviceID PermanentAddress PortType Speed MaxSpeed OperationalStatus"},
    {nullptr,    "their host",             "FC ports",             "CIM_SystemDevice",                       "PartComponent",      "GroupComponent",    "CIM_ComputerSystem",                          1,     1,    "Name"},
    {nullptr,    "port groups",            "FC ports",             "CIM_MemberOfCollection",                 "Member",             "Collection",        "CIM_LogicalPortGroup",                        0,     MANY, "InstanceID ElementName"},
    {nullptr,    "statistics",             "FC ports",             "CIM_ElementStatisticalData",             "ManagedElement",     "Stats",             "CIM_FCPortStatistics",                        0,     1,    "InstanceID"},
    {nullptr,    "beacons",                "FC ports",             "CIM_AssociatedAlarm",                    "Dependent",          "Antecedent",        "CIM_AlarmDevice",                             0,     MANY, "DeviceID VisibleAlarm"},
    {nullptr,    "initiators",             "FC ports",             "CIM_DeviceSAPImplementation",            "Antecedent",         "Dependent",         "CIM_SCSIProtocolEndpoint",                    1,     MANY, "Name ProtocolIFType OtherTypeDescription ConnectionType Role"},
    {nullptr,    "host of the initiators", "initiators",           "CIM_HostedAccessPoint",                  "Dependent",          "Antecedent",        "CIM_ComputerSystem",                          1,     1,    "Name"},
    {nullptr,    "logical units",          "initiators",           "CIM_SCSIInitiatorTargetLogicalUnitPath", "Initiator",          "LogicalUnit",       "CIM_LogicalDevice",                           0,     MANY, "DeviceID"},

    {nullptr,    nullptr,                  nullptr,                nullptr,                                  nullptr,              nullptr,             nullptr,                                       0,     0,    nullptr},
};
// clang-format on

} // namespace KPRV::kldrcim

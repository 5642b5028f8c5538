#include "kldrcim/walks/Topology_Plan.h"

namespace KPRV::kldrcim {

const char* const topology_root_class = "KALDERA_ComputerSystem";

using enum Node_Kind;
using enum Topology_Step::Taken;

// A path names initiator, target and unit at once; its two steps show the targets of an initiator, and the
// units of a target as far as that initiator sees them.
// clang-format off
const Topology_Step topology_steps[] = {
    {SYSTEM,        "KALDERA_PortControllerSystemDevice",             "GroupComponent", "PartComponent", ADAPTER,       nullptr,     ALWAYS},
    {ADAPTER,       "KALDERA_AdapterElementSoftwareIdentity",         "Dependent",      "Antecedent",    SOFTWARE,      nullptr,     WITH_SOFTWARE},
    {ADAPTER,       "KALDERA_Realizes",                               "Dependent",      "Antecedent",    CARD,          nullptr,     WITH_CONNECTORS},
    {CARD,          "KALDERA_PhysicalConnectorContainer",             "GroupComponent", "PartComponent", CONNECTOR,     nullptr,     WITH_CONNECTORS},
    {ADAPTER,       "KALDERA_ControlledBy",                           "Antecedent",     "Dependent",     FC_PORT,       nullptr,     ALWAYS},
    {ADAPTER,       "KALDERA_EthernetPortControlledBy",               "Antecedent",     "Dependent",     ETHERNET_PORT, nullptr,     ALWAYS},
    {FC_PORT,       "KALDERA_DeviceSAPImplementation",                "Antecedent",     "Dependent",     INITIATOR,     nullptr,     ALWAYS},
    {INITIATOR,     "KALDERA_SCSIInitiatorTargetLogicalUnitPath",     "Initiator",      "Target",        TARGET,        nullptr,     ALWAYS},
    {TARGET,        "KALDERA_SCSIInitiatorTargetLogicalUnitPath",     "Target",         "LogicalUnit",   UNIT,          "Initiator", ALWAYS},
    {ETHERNET_PORT, "KALDERA_HostedDependency",                       "Antecedent",     "Dependent",     FC_PORT,       nullptr,     CROSS_LINK},
    {CONNECTOR,     "KALDERA_EthernetPortRealizes",                   "Antecedent",     "Dependent",     ETHERNET_PORT, nullptr,     CROSS_LINK},
    {SYSTEM,        nullptr,                                          nullptr,          nullptr,         SYSTEM,        nullptr,     ALWAYS},
};
// clang-format on

} // namespace KPRV::kldrcim

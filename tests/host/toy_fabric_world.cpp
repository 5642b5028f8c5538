// The objects of the small host: an HBA with two ports that share a disk, and a converged adapter.
#include "toy_fabric.h"

namespace toy {

// clang-format off
const std::vector<Fabric_Class> fabric_classes = {
    {"TOY_Element",                    nullptr,       "",             nullptr, false},
    {"KALDERA_ComputerSystem",         "TOY_Element", "Name",         nullptr, true},
    {"KALDERA_PortController",         "TOY_Element", "DeviceID",     nullptr, true},
    {"KALDERA_PhysicalPackage",        "TOY_Element", "Tag",          nullptr, true},
    {"KALDERA_PhysicalConnector",      "TOY_Element", "Tag",          nullptr, true},
    {"KALDERA_AdapterSoftwareIdentity", "TOY_Element", "InstanceID",  nullptr, true},
    {"TOY_Port",                       "TOY_Element", "",             nullptr, false},
    {"KALDERA_FCPort",                 "TOY_Port",    "DeviceID",     nullptr, true},
    {"KALDERA_EthernetPort",           "TOY_Port",    "DeviceID",     nullptr, true},
    {"KALDERA_SCSIProtocolEndpoint",   "TOY_Element", "Name",         nullptr, true},
    {"KALDERA_StorageExtent",          "TOY_Element", "DeviceID",     nullptr, true},
    {"KALDERA_TapeDrive",              "TOY_Element", "DeviceID",     nullptr, true},
    {"TOY_Component",                              nullptr,         nullptr, "GroupComponent:TOY_Element PartComponent:TOY_Element", false},
    {"KALDERA_PortControllerSystemDevice",         "TOY_Component", nullptr, "GroupComponent:KALDERA_ComputerSystem PartComponent:KALDERA_PortController", true},
    {"TOY_PortSystemDevice",                       "TOY_Component", nullptr, "GroupComponent:KALDERA_ComputerSystem PartComponent:TOY_Port", true},
    // The second association between the system and its adapters.
    {"TOY_Scope",                                  nullptr,         nullptr, "Antecedent:KALDERA_ComputerSystem Dependent:KALDERA_PortController", true},
    {"KALDERA_ControlledBy",                       nullptr,         nullptr, "Antecedent:KALDERA_PortController Dependent:KALDERA_FCPort", true},
    {"KALDERA_EthernetPortControlledBy",           nullptr,         nullptr, "Antecedent:KALDERA_PortController Dependent:KALDERA_EthernetPort", true},
    {"KALDERA_AdapterElementSoftwareIdentity",     nullptr,         nullptr, "Antecedent:KALDERA_AdapterSoftwareIdentity Dependent:KALDERA_PortController", true},
    {"KALDERA_Realizes",                           nullptr,         nullptr, "Antecedent:KALDERA_PhysicalPackage Dependent:KALDERA_PortController", true},
    {"KALDERA_PhysicalConnectorContainer",         nullptr,         nullptr, "GroupComponent:KALDERA_PhysicalPackage PartComponent:KALDERA_PhysicalConnector", true},
    {"KALDERA_EthernetPortRealizes",               nullptr,         nullptr, "Antecedent:KALDERA_PhysicalConnector Dependent:KALDERA_EthernetPort", true},
    {"KALDERA_HostedDependency",                   nullptr,         nullptr, "Antecedent:KALDERA_EthernetPort Dependent:KALDERA_FCPort", true},
    {"KALDERA_DeviceSAPImplementation",            nullptr,         nullptr, "Antecedent:KALDERA_FCPort Dependent:KALDERA_SCSIProtocolEndpoint", true},
    {"KALDERA_SCSIInitiatorTargetLogicalUnitPath", nullptr,         nullptr, "Initiator:KALDERA_SCSIProtocolEndpoint Target:KALDERA_SCSIProtocolEndpoint LogicalUnit:TOY_Element", true},
    // Fails whenever it is asked.
    {"TOY_Broken",                                 nullptr,         nullptr, "Antecedent:KALDERA_TapeDrive Dependent:KALDERA_TapeDrive", true},
};

const std::vector<Fabric_Property> fabric_properties = {
    {"Name", 's'}, {"DeviceID", 's'}, {"Tag", 's'}, {"InstanceID", 's'}, {"Caption", 's'}, {"ElementName", 's'},
    {"Model", 's'}, {"SerialNumber", 's'}, {"PartNumber", 's'}, {"Manufacturer", 's'}, {"Description", 's'},
    {"VersionString", 's'}, {"EnabledState", 'n'}, {"Speed", 'N'}, {"OperationalStatus", 'a'}, {"Classifications", 'a'},
};

const std::vector<Fabric_Object> fabric_objects = {
    {"KALDERA_ComputerSystem",          "Name=10.0.0.5;OperationalStatus=2"},
    {"KALDERA_PortController",          "DeviceID=2000024b4c100000;Name=KLDR00A1001;Caption=Kaldera FC HBA;OperationalStatus=11"},
    {"KALDERA_PortController",          "DeviceID=00024b4c2000;Name=KLDR00C2001;Caption=Kaldera CNA;OperationalStatus=10"},
    {"KALDERA_PhysicalPackage",         "Tag=card-1;Model=HBA-82;SerialNumber=KLDR00A1001;PartNumber=P-82"},
    {"KALDERA_PhysicalPackage",         "Tag=card-2;Model=CNA-101;SerialNumber=KLDR00C2001"},
    {"KALDERA_PhysicalConnector",       "Tag=SFP01_1_0;Manufacturer=ACME;PartNumber=SW-8"},
    {"KALDERA_PhysicalConnector",       "Tag=SFP02_2_0;Manufacturer=ACME \"Optics\";Description=10G"},
    {"KALDERA_AdapterSoftwareIdentity", "InstanceID=zst;Classifications=2;VersionString=3.2.1"},
    {"KALDERA_AdapterSoftwareIdentity", "InstanceID=2000024b4c100000_bios;Classifications=32770;VersionString=1.4"},
    {"KALDERA_AdapterSoftwareIdentity", "InstanceID=2000024b4c100000_firmware;Classifications=10;VersionString=3.2.0"},
    {"KALDERA_FCPort",                  "DeviceID=1000024b4c100000;Speed=8000000000;EnabledState=2"},
    {"KALDERA_FCPort",                  "DeviceID=1000024b4c100001;Speed=0;EnabledState=3"},
    {"KALDERA_FCPort",                  "DeviceID=1000024b4c2000ff;Speed=2500000000;EnabledState=99"},
    {"KALDERA_EthernetPort",            "DeviceID=00024b4c2001;ElementName=eth4;OperationalStatus=11"},
    {"KALDERA_SCSIProtocolEndpoint",    "Name=1000024b4c100000;EnabledState=2"},
    {"KALDERA_SCSIProtocolEndpoint",    "Name=1000024b4c100001;EnabledState=3"},
    {"KALDERA_SCSIProtocolEndpoint",    "Name=1000024b4c100000_2000006016000001;EnabledState=2"},
    {"KALDERA_SCSIProtocolEndpoint",    "Name=shared_2000006016000002;EnabledState=9"},
    {"KALDERA_StorageExtent",           "DeviceID=1000024b4c100000_2000006016000001_ACME_Disk Array_LUN_0;ElementName=LUN_0;Name=naa.6001\\x"},
    {"KALDERA_StorageExtent",           "DeviceID=shared-unit;ElementName=LUN_1;Name=two\nlines"},
    {"KALDERA_TapeDrive",               "DeviceID=tape_only"},
};

const std::vector<Fabric_Link> fabric_links = {
    {"KALDERA_PortControllerSystemDevice",         {"10.0.0.5", "2000024b4c100000"}},
    {"KALDERA_PortControllerSystemDevice",         {"10.0.0.5", "00024b4c2000"}},
    {"TOY_PortSystemDevice",                       {"10.0.0.5", "1000024b4c100000"}},
    {"TOY_Scope",                                  {"10.0.0.5", "2000024b4c100000"}},
    {"TOY_Scope",                                  {"10.0.0.5", "00024b4c2000"}},
    {"KALDERA_AdapterElementSoftwareIdentity",     {"zst", "2000024b4c100000"}},
    {"KALDERA_AdapterElementSoftwareIdentity",     {"2000024b4c100000_bios", "2000024b4c100000"}},
    {"KALDERA_AdapterElementSoftwareIdentity",     {"2000024b4c100000_firmware", "2000024b4c100000"}},
    {"KALDERA_AdapterElementSoftwareIdentity",     {"zst", "00024b4c2000"}},
    {"KALDERA_Realizes",                           {"card-1", "2000024b4c100000"}},
    {"KALDERA_Realizes",                           {"card-2", "00024b4c2000"}},
    {"KALDERA_PhysicalConnectorContainer",         {"card-1", "SFP01_1_0"}},
    {"KALDERA_PhysicalConnectorContainer",         {"card-2", "SFP02_2_0"}},
    {"KALDERA_EthernetPortRealizes",               {"SFP02_2_0", "00024b4c2001"}},
    {"KALDERA_ControlledBy",                       {"2000024b4c100000", "1000024b4c100000"}},
    {"KALDERA_ControlledBy",                       {"2000024b4c100000", "1000024b4c100001"}},
    {"KALDERA_ControlledBy",                       {"00024b4c2000", "1000024b4c2000ff"}},
    {"KALDERA_EthernetPortControlledBy",           {"00024b4c2000", "00024b4c2001"}},
    {"KALDERA_HostedDependency",                   {"00024b4c2001", "1000024b4c2000ff"}},
    {"KALDERA_DeviceSAPImplementation",            {"1000024b4c100000", "1000024b4c100000"}},
    {"KALDERA_DeviceSAPImplementation",            {"1000024b4c100001", "1000024b4c100001"}},
    {"KALDERA_SCSIInitiatorTargetLogicalUnitPath", {"1000024b4c100000", "1000024b4c100000_2000006016000001", "1000024b4c100000_2000006016000001_ACME_Disk Array_LUN_0"}},
    {"KALDERA_SCSIInitiatorTargetLogicalUnitPath", {"1000024b4c100000", "1000024b4c100000_2000006016000001", "shared-unit"}},
    {"KALDERA_SCSIInitiatorTargetLogicalUnitPath", {"1000024b4c100000", "shared_2000006016000002", "tape_only"}},
    {"KALDERA_SCSIInitiatorTargetLogicalUnitPath", {"1000024b4c100001", "shared_2000006016000002", "shared-unit"}},
};
// clang-format on

} // namespace toy

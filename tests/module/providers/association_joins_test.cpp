#include "tests/module/providers/Association_Fixture.h"

namespace KPRV {
namespace {

struct Join_Row
{
    const char* association;
    const char* roles;
    const char* lists;
    const char* fetched;
    const char* pairs;
};

// clang-format off

// Every element of one list with every element of another.
constexpr Join_Row of_all[] = {
//   association, roles                                                                      lists                                                           fetched                                     pairs in these roles
    {"FCPortSystemDevice", "GroupComponent PartComponent",                                   "ComputerSystem: s; FCPort: p1, p2",                            "ComputerSystem, FCPort",                   "s p1, s p2"},
    {"EthernetPortSystemDevice", "GroupComponent PartComponent",                             "ComputerSystem: s; EthernetPort: p1, p2",                      "ComputerSystem, EthernetPort",             "s p1, s p2"},
    {"PortControllerSystemDevice", "GroupComponent PartComponent",                           "ComputerSystem: s; PortController: a1, a2",                    "ComputerSystem, PortController",           "s a1, s a2"},
    {"HostedAccessPoint", "Antecedent Dependent",                                            "ComputerSystem: s; SCSIProtocolEndpoint: e1, e2",              "ComputerSystem, SCSIProtocolEndpoint",     "s e1, s e2"},
    {"HostedLANEndpoint", "Antecedent Dependent",                                            "ComputerSystem: s; LANEndpoint: e1, e2",                       "ComputerSystem, LANEndpoint",              "s e1, s e2"},
    {"HostedCollection", "Antecedent Dependent",                                             "ComputerSystem: s; LogicalPortGroup: g1, g2",                  "ComputerSystem, LogicalPortGroup",         "s g1, s g2"},
    {"InstalledSoftwareIdentity", "System InstalledSoftware",                                "ComputerSystem: s; AdapterSoftwareIdentity: i1, i2",           "ComputerSystem, AdapterSoftwareIdentity",  "s i1, s i2"},
    {"RemoteServiceHostedAccessPoint", "Antecedent Dependent",                               "RemoteServiceAccessPoint: r; ComputerSystem: s",               "RemoteServiceAccessPoint, ComputerSystem", "s r"},
    {"HBASoftwareInstallationServiceHostedService", "Antecedent Dependent",                  "ComputerSystem: s; HBASoftwareInstallationService: v1, v2",    "ComputerSystem, HBASoftwareInstallationService", "s v1, s v2"},
    {"HBASoftwareInstallationServiceElementCapabilities", "ManagedElement Capabilities",     "HBASoftwareInstallationService: v; HBASoftwareInstallationServiceCapabilities: c", "HBASoftwareInstallationService, HBASoftwareInstallationServiceCapabilities", "v c"},
    {"AvailableDiagnosticServiceForAdapter", "ServiceProvided UserOfService",                "PortController: a1, a2; tests for adapters: t1, t2",           "PortController, tests for adapters",       "t1 a1, t2 a1, t1 a2, t2 a2"},
    {"AvailableDiagnosticServiceForEthernetPort", "ServiceProvided UserOfService",           "EthernetPort: p1, p2; tests for Ethernet ports: t1, t2",       "EthernetPort, tests for Ethernet ports",   "t1 p1, t2 p1, t1 p2, t2 p2"},
    {"DiagnosticElementSoftwareIdentity", "Antecedent Dependent",                            "DiagnosticSoftwareIdentity: d; all tests: t1, t2",             "DiagnosticSoftwareIdentity, all tests",    "d t1, d t2"},

    // These three are not sure of the count of systems: the first one is taken, whatever the count.
    {"FCPortSystemDevice", "GroupComponent PartComponent",                                   "ComputerSystem: s1, s2; FCPort: p1, p2",                       "ComputerSystem, FCPort",                   "s1 p1, s1 p2"},
    {"FCPortSystemDevice", "GroupComponent PartComponent",                                   "FCPort: p1",                                                   "ComputerSystem, FCPort",                   ""},
    {"FCPortSystemDevice", "GroupComponent PartComponent",                                   "ComputerSystem: s",                                            "ComputerSystem, FCPort",                   ""},
    {"EthernetPortSystemDevice", "GroupComponent PartComponent",                             "ComputerSystem: s1, s2; EthernetPort: p1",                     "ComputerSystem, EthernetPort",             "s1 p1"},
    {"EthernetPortSystemDevice", "GroupComponent PartComponent",                             "EthernetPort: p1",                                             "ComputerSystem, EthernetPort",             ""},
    {"EthernetPortSystemDevice", "GroupComponent PartComponent",                             "ComputerSystem: s",                                            "ComputerSystem, EthernetPort",             ""},
    {"HBASoftwareInstallationServiceHostedService", "Antecedent Dependent",                  "ComputerSystem: s1, s2; HBASoftwareInstallationService: v",    "ComputerSystem, HBASoftwareInstallationService", "s1 v"},
    {"HBASoftwareInstallationServiceHostedService", "Antecedent Dependent",                  "HBASoftwareInstallationService: v",                            "ComputerSystem, HBASoftwareInstallationService", ""},
    {"HBASoftwareInstallationServiceHostedService", "Antecedent Dependent",                  "ComputerSystem: s",                                            "ComputerSystem, HBASoftwareInstallationService", ""},

    // Every system, all extents first; nothing is checked.
    {"StorageResourcesSystemDevice", "GroupComponent PartComponent",                         "ComputerSystem: s1, s2; StorageExtent: x1, x2; TapeDrive: t",  "ComputerSystem, StorageExtent, TapeDrive", "s1 x1, s1 x2, s2 x1, s2 x2, s1 t, s2 t"},
    {"StorageResourcesSystemDevice", "GroupComponent PartComponent",                         "ComputerSystem: s; TapeDrive: t",                              "ComputerSystem, StorageExtent, TapeDrive", "s t"},
    {"StorageResourcesSystemDevice", "GroupComponent PartComponent",                         "StorageExtent: x; TapeDrive: t",                               "ComputerSystem, StorageExtent, TapeDrive", ""},
    {"StorageResourcesSystemDevice", "GroupComponent PartComponent",                         "",                                                             "ComputerSystem, StorageExtent, TapeDrive", ""},
    {"DiagnosticElementSoftwareIdentity", "Antecedent Dependent",                            "DiagnosticSoftwareIdentity: d; all tests: t1",                 "DiagnosticSoftwareIdentity, all tests",    "d t1"},
};

// Those whose texts are equal.
constexpr Join_Row of_equals[] = {
    // One index over both lists: what stands elsewhere gets no link.
    {"Realizes", "Antecedent Dependent",                 "PortController: a1 ElementName=x, a2 ElementName=y; PhysicalPackage: k1 SerialNumber=x, k2 SerialNumber=Y", "PortController, PhysicalPackage", "k1 a1, k2 a2"},
    {"Realizes", "Antecedent Dependent",                 "PortController: a1 ElementName=x, a2 ElementName=y; PhysicalPackage: k2 SerialNumber=y, k1 SerialNumber=x", "PortController, PhysicalPackage", ""},
    {"Realizes", "Antecedent Dependent",                 "PortController: a1 ElementName=x, a2 ElementName=y, a3 ElementName=z; PhysicalPackage: k2 SerialNumber=y, k1 SerialNumber=x, k3 SerialNumber=z", "PortController, PhysicalPackage", "k3 a3"},
    {"Realizes", "Antecedent Dependent",                 "", "PortController, PhysicalPackage", ""},

    {"ProductPhysicalComponent", "GroupComponent PartComponent", "PhysicalPackage: k1 SerialNumber=x, k2 SerialNumber=y; Product: q2 IdentifyingNumber=Y, q1 IdentifyingNumber=x", "PhysicalPackage, Product", "q1 k1, q2 k2"},
    {"ProductPhysicalComponent", "GroupComponent PartComponent", "PhysicalPackage: k1 SerialNumber=x, k2 SerialNumber=y; Product: q1 IdentifyingNumber=X, q2 IdentifyingNumber=x", "PhysicalPackage, Product", "q1 k1"},
    {"ProductPhysicalComponent", "GroupComponent PartComponent", "PhysicalPackage: k1 SerialNumber=x, k2 SerialNumber=X; Product: q1 IdentifyingNumber=x, q2 IdentifyingNumber=z", "PhysicalPackage, Product", "q1 k1, q1 k2"},
    {"ProductPhysicalComponent", "GroupComponent PartComponent", "", "PhysicalPackage, Product", ""},

    {"ProductElementComponent", "GroupComponent PartComponent",  "PortController: a1 Name=x, a2 Name=y; Product: q2 IdentifyingNumber=Y, q1 IdentifyingNumber=x", "PortController, Product", "q1 a1, q2 a2"},
    {"ProductElementComponent", "GroupComponent PartComponent",  "PortController: a1 Name=x, a2 Name=y; Product: q1 IdentifyingNumber=X, q2 IdentifyingNumber=x", "PortController, Product", "q1 a1"},
    {"ProductElementComponent", "GroupComponent PartComponent",  "", "PortController, Product", ""},

    {"AssociatedAlarm", "Antecedent Dependent",          "FCPort: p1 DeviceID=a, p2 DeviceID=b, p3 DeviceID=c; AlarmDevice: l2 DeviceID=B, l1 DeviceID=a", "FCPort, AlarmDevice", "l1 p1, l2 p2"},
    {"AssociatedAlarm", "Antecedent Dependent",          "FCPort: p1 DeviceID=a, p2 DeviceID=A; AlarmDevice: l1 DeviceID=a, l2 DeviceID=A", "FCPort, AlarmDevice", "l1 p1, l2 p1, l1 p2, l2 p2"},
    {"AssociatedAlarm", "Antecedent Dependent",          "FCPort: p1 DeviceID=a; AlarmDevice: l1 DeviceID=ab", "FCPort, AlarmDevice", ""},

    {"ElementStatisticalData", "ManagedElement Stats",   "FCPort: p1 DeviceID=a, p2 DeviceID=b, p3 DeviceID=c; FCPortStatistics: t2 InstanceID=B, t1 InstanceID=a", "FCPort, FCPortStatistics", "p1 t1, p2 t2"},
    {"ElementStatisticalData", "ManagedElement Stats",   "FCPort: p1 DeviceID=a, p2 DeviceID=A; FCPortStatistics: t1 InstanceID=a, t2 InstanceID=A", "FCPort, FCPortStatistics", "p1 t1, p1 t2, p2 t1, p2 t2"},
    {"ElementStatisticalData", "ManagedElement Stats",   "FCPort: p1 DeviceID=a; FCPortStatistics: t1 InstanceID=b", "FCPort, FCPortStatistics", ""},

    {"MemberOfCollection", "Collection Member",          "FCPort: p1 DeviceID=a, p2 DeviceID=b, p3 DeviceID=c; LogicalPortGroup: g2 Name=B, g1 Name=a", "FCPort, LogicalPortGroup", "g1 p1, g2 p2"},
    {"MemberOfCollection", "Collection Member",          "FCPort: p1 DeviceID=a, p2 DeviceID=A; LogicalPortGroup: g1 Name=a, g2 Name=A", "FCPort, LogicalPortGroup", "g1 p1, g1 p2"},
    {"MemberOfCollection", "Collection Member",          "FCPort: p1 DeviceID=a; LogicalPortGroup: g1 Name=b", "FCPort, LogicalPortGroup", ""},

    {"DeviceSAPImplementation", "Antecedent Dependent",  "SCSIProtocolEndpoint: e2 Name=B, e1 Name=a; FCPort: p1 DeviceID=a, p2 DeviceID=b, p3 DeviceID=c", "SCSIProtocolEndpoint, FCPort", "p1 e1, p2 e2"},
    {"DeviceSAPImplementation", "Antecedent Dependent",  "SCSIProtocolEndpoint: e1 Name=a, e2 Name=A; FCPort: p1 DeviceID=a, p2 DeviceID=A", "SCSIProtocolEndpoint, FCPort", "p1 e1, p2 e1"},
    {"DeviceSAPImplementation", "Antecedent Dependent",  "SCSIProtocolEndpoint: e1 Name=b; FCPort: p1 DeviceID=a", "SCSIProtocolEndpoint, FCPort", ""},

    {"LANEndpointDeviceSAPImplementation", "Antecedent Dependent", "EthernetPort: p1 DeviceID=a, p2 DeviceID=b; LANEndpoint: e2 MACAddress=B, e1 MACAddress=a", "EthernetPort, LANEndpoint", "p1 e1, p2 e2"},
    {"LANEndpointDeviceSAPImplementation", "Antecedent Dependent", "EthernetPort: p1 DeviceID=a, p2 DeviceID=c; LANEndpoint: e1 MACAddress=a, e2 MACAddress=A", "EthernetPort, LANEndpoint", "p1 e1"},
};

// clang-format on

class Association_Joins : public Association_Fixture
{
protected:
    void check(const Join_Row& row)
    {
        SCOPED_TRACE(std::string(row.association) + " over " + row.lists);
        // One says the same in its own words.
        const bool louder = row.association == std::string("PortControllerSystemDevice");
        lists(row.lists);
        const Enumeration result = enumerate(row.association, row.roles);
        EXPECT_EQ(pieces(row.pairs, ','), result.pairs);
        EXPECT_EQ(pieces(row.fetched, ','), result.fetched);
        EXPECT_EQ(Lines{louder ? "INFO Building and returning association instances...." : BUILDING},
                  result.said);
        EXPECT_EQ(0, result.status);
        EXPECT_EQ(std::vector<int>{0}, result.end_marks);
    }
};

TEST_F(Association_Joins, PairEachWithEach)
{
    for (const Join_Row& row : of_all)
        check(row);
}

TEST_F(Association_Joins, PairEqualTextsWhateverTheirCase)
{
    for (const Join_Row& row : of_equals)
        check(row);
}

} // namespace
} // namespace KPRV

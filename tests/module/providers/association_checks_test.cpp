#include "tests/module/providers/Association_Fixture.h"

namespace KPRV {
namespace {

struct Row
{
    const char* association;
    const char* lists;
    const char* fetched;
    const char* said;
    int status;
};

// The level says nothing of the status: there are errors that end well.
// clang-format off
constexpr Row rows[] = {
//   association                                           lists                                                          fetched until then                           line of the log                                                       status
    {"FCPortSystemDevice",                                "",                                                             "ComputerSystem, FCPort",                    "ERR Error: Invalid mapping information",                             70},
    {"FCPortSystemDevice",                                "ComputerSystem: s1, s2",                                       "ComputerSystem, FCPort",                    "ERR Error: Invalid mapping information",                             70},
    {"EthernetPortSystemDevice",                          "",                                                             "ComputerSystem, EthernetPort",              "ERR Invalid mapping information",                                    70},
    {"EthernetPortSystemDevice",                          "ComputerSystem: s1, s2",                                       "ComputerSystem, EthernetPort",              "ERR Invalid mapping information",                                    70},
    {"HBASoftwareInstallationServiceHostedService",       "",                                                             "ComputerSystem, HBASoftwareInstallationService", "ERR Error: Invalid mapping information",                        70},
    {"HBASoftwareInstallationServiceHostedService",       "ComputerSystem: s1, s2",                                       "ComputerSystem, HBASoftwareInstallationService", "ERR Error: Invalid mapping information",                        70},
    {"PortControllerSystemDevice",                        "PortController: a",                                            "ComputerSystem",                            "ERR Error: Returned instances for ComputerSystem is not 1",          70},
    {"PortControllerSystemDevice",                        "ComputerSystem: s1, s2; PortController: a",                    "ComputerSystem",                            "ERR Error: Returned instances for ComputerSystem is not 1",          70},
    {"PortControllerSystemDevice",                        "ComputerSystem: s",                                            "ComputerSystem, PortController",            "ERR Error: Invalid mapping information",                             0},
    {"HostedAccessPoint",                                 "SCSIProtocolEndpoint: e",                                      "ComputerSystem",                            "ERR Error: Invalid mapping information",                             70},
    {"HostedAccessPoint",                                 "ComputerSystem: s1, s2; SCSIProtocolEndpoint: e",              "ComputerSystem",                            "ERR Error: Invalid mapping information",                             70},
    {"HostedAccessPoint",                                 "ComputerSystem: s",                                            "ComputerSystem, SCSIProtocolEndpoint",      "WARN Invalid number of SCSIProtocolEndPoint instances returned.",    0},
    {"HostedLANEndpoint",                                 "LANEndpoint: e",                                               "ComputerSystem",                            "ERR Error: Invalid number of ComputerSystem instances",              70},
    {"HostedLANEndpoint",                                 "ComputerSystem: s1, s2; LANEndpoint: e",                       "ComputerSystem",                            "ERR Error: Invalid number of ComputerSystem instances",              70},
    {"HostedLANEndpoint",                                 "ComputerSystem: s",                                            "ComputerSystem, LANEndpoint",               "WARN No Ethernet Port Found",                                        0},
    {"HostedCollection",                                  "LogicalPortGroup: g",                                          "ComputerSystem",                            "ERR Error: Invalid mapping information",                             70},
    {"HostedCollection",                                  "ComputerSystem: s1, s2; LogicalPortGroup: g",                  "ComputerSystem",                            "ERR Error: Invalid mapping information",                             70},
    {"HostedCollection",                                  "ComputerSystem: s",                                            "ComputerSystem, LogicalPortGroup",          "WARN No Logical Port Groups found!",                                 0},
    {"RemoteServiceHostedAccessPoint",                    "ComputerSystem: s",                                            "RemoteServiceAccessPoint",                  "WARN Warning: No service is available",                              0},
    {"RemoteServiceHostedAccessPoint",                    "RemoteServiceAccessPoint: r1, r2; ComputerSystem: s",          "RemoteServiceAccessPoint, ComputerSystem",  "ERR Error: Invalid mapping information",                             70},
    {"RemoteServiceHostedAccessPoint",                    "RemoteServiceAccessPoint: r",                                  "RemoteServiceAccessPoint, ComputerSystem",  "ERR Error: Invalid mapping information",                             70},
    {"RemoteServiceHostedAccessPoint",                    "RemoteServiceAccessPoint: r; ComputerSystem: s1, s2",          "RemoteServiceAccessPoint, ComputerSystem",  "ERR Error: Invalid mapping information",                             70},
    {"HBASoftwareInstallationServiceElementCapabilities", "HBASoftwareInstallationServiceCapabilities: c",                "HBASoftwareInstallationService",            "ERR Error: Invalid mapping information for service",                 0},
    {"HBASoftwareInstallationServiceElementCapabilities", "HBASoftwareInstallationService: v1, v2",                       "HBASoftwareInstallationService",            "ERR Error: Invalid mapping information for service",                 0},
    {"HBASoftwareInstallationServiceElementCapabilities", "HBASoftwareInstallationService: v",                            "HBASoftwareInstallationService, HBASoftwareInstallationServiceCapabilities", "ERR Error: Invalid mapping information for capabilities", 0},
    {"HBASoftwareInstallationServiceElementCapabilities", "HBASoftwareInstallationService: v; HBASoftwareInstallationServiceCapabilities: c1, c2", "HBASoftwareInstallationService, HBASoftwareInstallationServiceCapabilities", "ERR Error: Invalid mapping information for capabilities", 0},
    {"InstalledSoftwareIdentity",                         "AdapterSoftwareIdentity: i",                                   "ComputerSystem",                            "ERR Error: count of computersystem instance is not 1",               70},
    {"InstalledSoftwareIdentity",                         "ComputerSystem: s1, s2; AdapterSoftwareIdentity: i",           "ComputerSystem",                            "ERR Error: count of computersystem instance is not 1",               70},
    {"InstalledSoftwareIdentity",                         "ComputerSystem: s",                                            "ComputerSystem, AdapterSoftwareIdentity",   "ERR Error: Invalid mapping information",                             0},
    {"Realizes",                                          "PortController: a1 ElementName=x, a2 ElementName=y; PhysicalPackage: k SerialNumber=x", "PortController, PhysicalPackage", "ERR Error: Invalid number of instances returned!",  70},
    {"Realizes",                                          "PhysicalPackage: k",                                           "PortController, PhysicalPackage",           "ERR Error: Invalid number of instances returned!",                 70},
    {"ProductPhysicalComponent",                          "PhysicalPackage: k SerialNumber=x; Product: q1 IdentifyingNumber=x, q2", "PhysicalPackage, Product",        "ERR Error: Improper Product Information!",                         70},
    {"ProductPhysicalComponent",                          "PhysicalPackage: k",                                           "PhysicalPackage, Product",                  "ERR Error: Improper Product Information!",                         70},
    {"ProductElementComponent",                           "PortController: a Name=x; Product: q1 IdentifyingNumber=x, q2", "PortController, Product",                  "ERR Invalid mapping information.",                                   70},
    {"ProductElementComponent",                           "PortController: a",                                            "PortController, Product",                   "ERR Invalid mapping information.",                                   70},
    {"AssociatedAlarm",                                   "AlarmDevice: l",                                               "FCPort",                                    "WARN No FC Ports Found!",                                            0},
    {"AssociatedAlarm",                                   "FCPort: p",                                                    "FCPort, AlarmDevice",                       "WARN Invalid number of Instances!",                                  0},
    {"ElementStatisticalData",                            "FCPortStatistics: t",                                          "FCPort",                                    "WARN No FC Ports Found",                                             0},
    {"ElementStatisticalData",                            "FCPort: p",                                                    "FCPort, FCPortStatistics",                  "WARN Invalid number of Port Statistice Instances!",                  0},
    {"MemberOfCollection",                                "LogicalPortGroup: g",                                          "FCPort",                                    "WARN No FC Ports Found!",                                            0},
    {"MemberOfCollection",                                "FCPort: p",                                                    "FCPort, LogicalPortGroup",                  "ERR Error: Invalid number of instances returned!",                 70},
    {"DeviceSAPImplementation",                           "FCPort: p",                                                    "SCSIProtocolEndpoint",                      "ERR Error: Invalid number of instances returned",                    0},
    {"DeviceSAPImplementation",                           "SCSIProtocolEndpoint: e",                                      "SCSIProtocolEndpoint, FCPort",              "ERR Error: No FCPort found!",                                        0},
    {"LANEndpointDeviceSAPImplementation",                "LANEndpoint: e",                                               "EthernetPort",                              "WARN No Ethernet Port Found",                                        0},
    {"LANEndpointDeviceSAPImplementation",                "EthernetPort: p",                                              "EthernetPort, LANEndpoint",                 "WARN Invalid number of EndPoint instances ",                         0},
    {"LANEndpointDeviceSAPImplementation",                "EthernetPort: p1 DeviceID=a, p2 DeviceID=b; LANEndpoint: e1 MACAddress=a", "EthernetPort, LANEndpoint",     "ERR Error: Invalid mapping information!",                            70},
    {"LANEndpointDeviceSAPImplementation",                "EthernetPort: p1 DeviceID=a; LANEndpoint: e1 MACAddress=a, e2 MACAddress=b", "EthernetPort, LANEndpoint",   "ERR Error: Invalid mapping information!",                            70},
    {"PhysicalConnectorContainer",                        "PhysicalPackage: k",                                           "PhysicalConnector",                         "WARN No Connectors retrieved",                                     0},
    {"PhysicalConnectorContainer",                        "PhysicalConnector: c Tag=x_1_0",                               "PhysicalConnector, PhysicalPackage",        "WARN No PhysicalPackage retrieved",                                0},
    {"EthernetPortRealizes",                              "",                                                             "PhysicalConnector",                         "WARN No Connector Found",                                            0},
    {"AvailableDiagnosticServiceForAdapter",              "tests for adapters: t",                                        "PortController",                            "WARN No adapters are present in the host for running dianostics.",   0},
    {"AvailableDiagnosticServiceForAdapter",              "PortController: a",                                            "PortController, tests for adapters",        "WARN No diagnostic tests are available.",                            0},
    {"AvailableDiagnosticServiceForEthernetPort",         "tests for Ethernet ports: t",                                  "EthernetPort",                              "WARN No ethernet ports are present for running dianostics.",         0},
    {"AvailableDiagnosticServiceForEthernetPort",         "EthernetPort: p",                                              "EthernetPort, tests for Ethernet ports",    "WARN No diagnostic tests are available.",                            0},
    {"AvailableDiagnosticServiceForFCPort",               "tests for FC ports: t",                                        "PortController",                            "WARN No adapters are available.",                                    0},
    {"AvailableDiagnosticServiceForFCPort",               "PortController: a",                                            "PortController, tests for FC ports",        "WARN No diagnostic tests are available.",                            0},
    {"DiagnosticElementSoftwareIdentity",                 "all tests: t",                                                 "DiagnosticSoftwareIdentity",                "WARN No diagnostic softwares are installed.",                        0},
    {"DiagnosticElementSoftwareIdentity",                 "DiagnosticSoftwareIdentity: d1, d2; all tests: t",             "DiagnosticSoftwareIdentity",                "ERR Error: Invalid number of instances.",                            70},
    {"DiagnosticElementSoftwareIdentity",                 "DiagnosticSoftwareIdentity: d",                                "DiagnosticSoftwareIdentity, all tests",     "WARN No diagnostic services are available.",                         0},
    {"OwningJobElement",                                  "all tests: t",                                                 "ConcreteJob",                               "INFO No jobs are currently running in the system.",                  0},
    {"AffectedJobElement",                                "",                                                             "AffectedJobElement",                        "INFO Any affectedJobElement association could not be formed.",       0},
    {"ServiceRecordAppliesToElement",                     "",                                                             "ServiceRecordAppliesToElement",             "INFO No service records or managed elements are present.",           0},
    {"CompletionRecordAppliesToElement",                  "",                                                             "CompletionRecordAppliesToElement",          "INFO No completion records or managed elements are present.",        0},
};
// clang-format on

class Association_Checks : public Association_Fixture
{
};

TEST_F(Association_Checks, SayWhatIsWrongWithTheListsAndEndAsTold)
{
    for (const Row& row : rows) {
        SCOPED_TRACE(std::string(row.association) + " over " + row.lists);
        lists(row.lists);
        const Enumeration result = enumerate(row.association, "");
        EXPECT_TRUE(result.pairs.empty());
        EXPECT_EQ(pieces(row.fetched, ','), result.fetched);
        EXPECT_EQ(Lines{row.said}, result.said);
        EXPECT_EQ(row.status, result.status);
        EXPECT_EQ(std::vector<int>{row.status}, result.end_marks);
        EXPECT_TRUE(library_calls.empty());
    }
}

} // namespace
} // namespace KPRV

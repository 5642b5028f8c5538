#include "tests/module/exports/Module_Fixture.h"

namespace KPRV {
namespace {

// What each provider says, and how its enumeration ends, when its manager has nothing to give.
struct Row
{
    const char* class_name;
    const char* said;
    CMPIrc rc;
};

// clang-format off
constexpr Row rows[] = {
//   class                                                 line of the log                                                        client sees
    {"KALDERA_PortController",                             "ERR No Adapter Found!",                                                CMPI_RC_OK},
    {"KALDERA_FCPort",                                     "ERR No FC Ports Found!",                                               CMPI_RC_OK},
    {"KALDERA_SCSIProtocolEndpoint",                       "ERR No FC Ports Found!",                                               CMPI_RC_OK},
    {"KALDERA_FCPortStatistics",                           "ERR No FC Ports Found!",                                               CMPI_RC_OK},
    {"KALDERA_PhysicalPackage",                            "ERR No Adapter Found!",                                                CMPI_RC_OK},
    {"KALDERA_Product",                                    "ERR No Adapter Found!",                                                CMPI_RC_OK},
    {"KALDERA_AdapterSoftwareIdentity",                    "ERR No Adapter Found!",                                                CMPI_RC_OK},
    {"KALDERA_StorageExtent",                              "ERR No StorageExtents Found!",                                         CMPI_RC_OK},
    {"KALDERA_TapeDrive",                                  "ERR No TapeDrives Found!",                                             CMPI_RC_OK},
    {"KALDERA_RemoteServiceAccessPoint",                   "WARN Warning: No service is available",                                CMPI_RC_OK},
    {"KALDERA_EthernetPort",                               "ERR Error: Invalid mapping information",                               CMPI_RC_OK},
    {"KALDERA_MemoryDiagnosticTest",                       "WARN No memory diagnostic test is available",                          CMPI_RC_OK},
    {"KALDERA_LoopbackDiagnosticTest",                     "WARN No loopback diagnostic test is available",                        CMPI_RC_OK},
    {"KALDERA_PCILoopbackDiagnosticTest",                  "WARN No PCI loopback diagnostic test is available",                    CMPI_RC_OK},
    {"KALDERA_EthLoopbackDiagnosticTest",                  "WARN No ethloopback diagnostic test is available",                     CMPI_RC_OK},
    {"KALDERA_DiagnosticSoftwareIdentity",                 "WARN No diagnostic software is installed",                             CMPI_RC_OK},
    {"KALDERA_ConcreteJob",                                "INFO No jobs are currently running in the system.",                    CMPI_RC_OK},
    {"KALDERA_DiagnosticServiceRecord",                    "INFO No diagnostic service records are available.",                    CMPI_RC_OK},
    {"KALDERA_DiagnosticCompletionRecord",                 "INFO No completion records are available.",                            CMPI_RC_OK},
    {"KALDERA_LogicalPortGroup",                           "WARN No Logical Port Groups found!",                                   CMPI_RC_OK},
    {"KALDERA_LANEndpoint",                                "WARN No Ethernet Port Found",                                          CMPI_RC_OK},
    {"KALDERA_PhysicalConnector",                          "ERR No Connector Found!",                                              CMPI_RC_OK},
    {"KALDERA_AlarmDevice",                                "ERR Invalid number of Instances returned",                             CMPI_RC_OK},
    {"KALDERA_LogicalDisk",                                "ERR No LogicalDisks Found!",                                           CMPI_RC_OK},
};
// clang-format on

// These are always there.
constexpr const char* constants[] = {
    "KALDERA_RegisteredProfile",
    "KALDERA_RegisteredSubProfile",
    "KALDERA_Namespace",
    "KALDERA_ObjectManager",
    "KALDERA_CIMXMLCommunicationMechanism",
    "KALDERA_ProfileSoftwareIdentity",
    "KALDERA_AgentService",
    "KALDERA_ComputerSystem",
    "KALDERA_HBASoftwareInstallationService",
    "KALDERA_HBASoftwareInstallationServiceCapabilities",
};
static_assert(std::size(rows) + std::size(constants) == 34);

class Provider_Family : public Module_Fixture
{
};

TEST_F(Provider_Family, SaysItsWordsOverAnEmptyListAndEndsAsToldToTheClient)
{
    open("empty.json");
    for (const Row& row : rows) {
        SCOPED_TRACE(row.class_name);
        mark();
        const broker::Result result = server->enumerate_instances(row.class_name);
        EXPECT_EQ(row.rc, result.rc);
        EXPECT_EQ(row.rc == CMPI_RC_OK ? 1u : 0u, result.done_count);
        EXPECT_TRUE(result.instances.empty());
        Lines expected = {"DBG Entering: enum_instances"};
        if (row.said)
            expected.push_back(row.said);
        expected.push_back("DBG Returning: enum_instances");
        EXPECT_EQ(expected, said_by(std::string(row.class_name) + "_Provider.cpp"));
    }
}

TEST_F(Provider_Family, PublishesHostAndServerAlsoWhereThereIsNoAdapter)
{
    open("empty.json");
    for (const char* class_name : constants) {
        SCOPED_TRACE(class_name);
        mark();
        const broker::Result result = server->enumerate_instances(class_name);
        EXPECT_EQ(CMPI_RC_OK, result.rc);
        EXPECT_EQ(1u, result.done_count);
        EXPECT_FALSE(result.instances.empty());
        EXPECT_EQ((Lines{"DBG Entering: enum_instances", "DBG Returning instances",
                         "DBG Returning: enum_instances"}),
                  said_by(std::string(class_name) + "_Provider.cpp"));
        EXPECT_TRUE(simulator.call_names().empty());
    }
}

TEST_F(Provider_Family, IsReadOnly)
{
    open("empty.json");
    std::vector<const char*> classes(std::begin(constants), std::end(constants));
    for (const Row& row : rows)
        classes.push_back(row.class_name);
    for (const char* class_name : classes) {
        SCOPED_TRACE(class_name);
        const broker::Path_Value path = {{}, "root/kaldera", class_name, {}};
        const broker::Instance_Value instance = {path, {}};
        EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->create_instance(instance).rc);
        EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->modify_instance(instance).rc);
        EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->delete_instance(path).rc);
    }
}

} // namespace
} // namespace KPRV

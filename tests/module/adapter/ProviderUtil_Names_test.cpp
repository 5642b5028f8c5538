#include "module/adapter/ProviderUtil.h"

#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

using namespace KPRV;

TEST(ProviderUtil_Names, ClassesByNumber)
{
    // Written out, so that a change of the table shows.
    constexpr const char* names[] = {
        "--",
        "KALDERA_ComputerSystem",
        "KALDERA_PortController",
        "KALDERA_FCPort",
        "KALDERA_SCSIProtocolEndpoint",
        "KALDERA_FCPortStatistics",
        "KALDERA_PhysicalPackage",
        "KALDERA_Product",
        "KALDERA_AdapterSoftwareIdentity",
        "KALDERA_StorageExtent",
        "KALDERA_RegisteredProfile",
        "KALDERA_RegisteredSubProfile",
        "KALDERA_Namespace",
        "KALDERA_ObjectManager",
        "KALDERA_CIMXMLCommunicationMechanism",
        "KALDERA_ProfileSoftwareIdentity",
        "KALDERA_TapeDrive",
        "KALDERA_RemoteServiceAccessPoint",
        "KALDERA_HBASoftwareInstallationService",
        "KALDERA_HBASoftwareInstallationServiceCapabilities",
        "KALDERA_EthernetPort",
        "KALDERA_MemoryDiagnosticTest",
        "KALDERA_LoopbackDiagnosticTest",
        "KALDERA_PCILoopbackDiagnosticTest",
        "KALDERA_EthLoopbackDiagnosticTest",
        "KALDERA_DiagnosticSoftwareIdentity",
        "KALDERA_ConcreteJob",
        "KALDERA_DiagnosticServiceRecord",
        "KALDERA_DiagnosticCompletionRecord",
        "KALDERA_DiagnosticElementSoftwareIdentity",
        "KALDERA_LogicalPortGroup",
        "KALDERA_AffectedJobElement",
        "KALDERA_ServiceRecordAppliesToElement",
        "KALDERA_CompletionRecordAppliesToElement",
        "KALDERA_LANEndpoint",
        "KALDERA_PhysicalConnector",
        "KALDERA_AlarmDevice",
        "KALDERA_AgentService",
        "KALDERA_LogicalDisk",
    };
    static_assert(std::size(names) == 39);
    for (uint32 id = 0; id < 39; id++)
        EXPECT_STREQ(ProviderUtil::getClassName(classId_t(id)), names[id]) << id;
}

TEST(ProviderUtil_Names, ClassesBeyondTheTable)
{
    Log_Capture log;
    EXPECT_STREQ(ProviderUtil::getClassName(classId_t(39)), "INVALID CLASS");
    EXPECT_STREQ(ProviderUtil::getClassName(classId_t(-1)), "INVALID CLASS");
    EXPECT_EQ(log.said(), (Lines(2, "INFO ClassId is greater than MAXCLASSID")));
}

TEST(ProviderUtil_Names, RecordTexts)
{
    constexpr const char* texts[] = {
        "--",
        "Checking whether the adapter is disabled for running memory test",
        "Adapter is not disabled",
        "Disabling the adapter for running memory test",
        "Enabling the adapter after running memory test",
        "Running memory test on the adapter",
        "Checking for return codes for memory test run",
        "Memory test run is successful",
        "Memory test failed",
        "Running PCI Loopback test for the port",
        "Checking for return codes for PCI Loopback test run",
        "PCI Loopback test run is successful",
        "PCI Loopback test failed",
        "Checking whether the port is disabled for running loopback test",
        "Port is already disabled",
        "Port is not disabled",
        "Disabling the port for running loopback test",
        "Enabling the port after running loopback test",
        "Running loopback test for the port",
        "Checking for return codes for loopback test run",
        "Loopback test run is successful",
        "Loopback test failed",
        "Checking whether the port is disabled for running eth loopback test",
        "Disabling the port for running eth loopback test",
        "Enabling the port after running eth loopback test",
        "Running eth loopback test for the port",
        "Checking for return codes for eth loopback test run",
        "Eth loopback test run is successful",
        "Eth loopback test failed",
        "Disabling the port",
        "Enabling the port",
        "Failed to disable the port",
        "Running memory test may take a few moments",
        "Adapter is already disabled",
        "Eth loopback test aborted",
        "Unknown failure",
    };
    static_assert(std::size(texts) == 36);
    for (uint32 id = 0; id < 36; id++)
        EXPECT_STREQ(ProviderUtil::getRecordData(diag_record_msg_t(id)), texts[id]) << id;

    Log_Capture log;
    EXPECT_STREQ(ProviderUtil::getRecordData(diag_record_msg_t(36)), "INVALID RECORD ID");
    EXPECT_EQ(log.said(), Lines{"ERR Record ID is greater than REC_MAX_ID"});
}

TEST(ProviderUtil_Names, TestNames)
{
    constexpr const char* names[] = {
        "Kaldera:--",
        "Kaldera:MemoryTest",
        "Kaldera:InternalLoopbackTest",
        "Kaldera:ExternalLoopbackTest",
        "Kaldera:SerdesLoopbackTest",
        "Kaldera:PCILoopbackTest",
        "Kaldera:ExternalEthLoopbackTest",
        "Kaldera:SerdesEthLoopbackTest",
    };
    static_assert(std::size(names) == 8);
    for (uint32 id = 0; id < 8; id++)
        EXPECT_STREQ(ProviderUtil::getDiagTestName(diag_test_id_t(id)), names[id]) << id;

    Log_Capture log;
    EXPECT_STREQ(ProviderUtil::getDiagTestName(diag_test_id_t(8)), "INVALID DIAGNOSTIC ID");
    EXPECT_EQ(log.said(), Lines{"INFO Diag Test Id is greater than DIAG_NAME_INVALID"});
}

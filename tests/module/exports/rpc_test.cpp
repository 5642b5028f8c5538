// `kldrcim rpc` on the built module and the demo host: every method of the table, errors, and what is kept.
#include "tests/module/exports/Module_Fixture.h"

#include "kldrcim/Cli.h"
#include "kldrcim/walks/Rpc_Methods.h"

#include <json/json.h>

#include <iterator>
#include <set>
#include <sstream>

namespace KPRV {
namespace {

#define HBA "20:00:02:4b:4c:10:00:00"
#define FC "10:00:02:4b:4c:10:00:00"
#define FCOE "10:00:02:4b:4c:20:00:00"
#define CNA "20:00:02:4b:4c:20:00:00"
#define ETH "02:4b:4c:20:00:00"
#define ARRAY "50:24:b4:c0:00:40:00:01"
#define VPORT "10:01:02:4b:4c:10:00:00"
#define BEHIND FC " " FC
#define TARGETS                                                                                              \
    "[{\"vfID\":0,\"portWwn\":\"" FC "\",\"localPortWwn\":\"" FC "\",\"remotePortWwn\":\"" ARRAY "\"}]"

// One call of each method that the demo host answers, in an order in which they can be made: words between
// blanks.
const char* const calls[] = {
    "discovery.getHost",
    "discovery.getGlobalInfo",
    "discovery.getHbaByWwn " HBA,
    "discovery.getAllHbasByHost",
    "discovery.getAllPortsByHba " CNA,
    "discovery.getPortByWwn " FC,
    "discovery.getFcByFcWwn " FC,
    "discovery.getAllFcByPort " FC,
    "discovery.getPortStatistics " FC,
    "discovery.getPortAuthentication " FC,
    "discovery.getAllRemotePorts " BEHIND,
    "discovery.getCompleteRemotePort " BEHIND " " ARRAY,
    "discovery.getAllLunsByRemotePort " BEHIND " " ARRAY,
    "configuration.createVPort " FC " 20:01:02:4b:4c:10:00:00 " VPORT " guest",
    "discovery.getAllVPorts " FC,
    "discovery.getVPort " FC " " VPORT,
    "discovery.getServerTime",
    "discovery.getDynamicQosStatistics " FC,
    "discovery.getDynamicPortStatistics " FC,
    "discovery.getDynamicRemotePortStatistics " BEHIND " " ARRAY,
    "discovery.getDynamicVportStatistics " FC " " VPORT,
    "discovery.getDynamicLogicalPortStatistics " BEHIND,
    "discovery.getDynamicFcpimIOPStatistics " BEHIND " " ARRAY,
    "discovery.getDynamicFcpimStatistics " BEHIND " " ARRAY,
    "discovery.getDynamicFabricStatistics " FC,
    "discovery.getDynamicPortAuthenticationStatistics " FC,
    "discovery.getDynamicIocStatistics " FC,
    "discovery.getBootOverSanByPort " FC,
    "discovery.getAdvPortDataByPort " FC,
    "discovery.getAllFcoeByPort " FCOE,
    "discovery.getDynamicFcoeStatistics " FCOE,
    "discovery.getDynamicFcpimModStatistics " FC,
    "discovery.getDynamicFirmwareStatistics " HBA,
    "discovery.getDynamicTrunkingStatistics " HBA,
    "discovery.getCompleteEthByPort " ETH,
    "discovery.getCompleteEthByEthMac " ETH,
    "discovery.getAllEthByPort " ETH,
    "discovery.getLldp " ETH,
    "discovery.getCee " ETH,
    "discovery.getDynamicEthernetPortStatistics " ETH,
    "discovery.getDynamicIOCEthernetStatistics " ETH,
    "discovery.getDynamicvHBAStatistics " FC,
    "discovery.getDynamicvNICStatistics " ETH,
    "discovery.getDynamicvNICStatisticsForGraph " ETH,
    "discovery.getDynamicLldpStatistics " ETH,
    "discovery.getDynamicAdvancedIoDataAtPPort " FC,
    "discovery.getDynamicAdvancedIoDataAtLPort " BEHIND,
    "discovery.getDynamicAdvancedIoDataAtRPort " BEHIND " " ARRAY,
    "discovery.getDynamicAdvancedIoDataAtLun " BEHIND " " ARRAY " 1",
    "discovery.getDriverUpdateStatusLog",
    "discovery.getLunMaskDataByPort " FC,
    "discovery.getAdvAdapterData " HBA,
    "discovery.getAllPCIFunctions " CNA,
    "discovery.getAdvancedIoProfile " FC,

    "configuration.setAlias {\"type\":\"Node\",\"Node\":\"" HBA "\",\"alias\":\"a\"}",
    "configuration.setAliases [[{\"type\":\"Port\",\"Node\":\"" FC "\",\"alias\":\"b\"}]]",
    "configuration.setPortByWwn " FC " {\"beaconState\":true} [\"beaconState\"]",
    "configuration.setPortAuthentication " FC " {\"enabled\":true,\"secret\":\"s\"}",
    "configuration.setHbaStatus " HBA " true",
    "configuration.setFCTrunkingState " HBA " true",
    "configuration.setFcoePort " FCOE " {\"vlanId\":1003} [\"vlanId\"]",
    "configuration.setEthPort " ETH " {\"mtu\":1500} [\"mtu\"]",
    "configuration.clearLogsForPort [[\"" FC "\"]]",
    "configuration.setAdapterMode " HBA " HBA",
    "configuration.setLunMaskDataForPort " FC " {\"addedLunMaskData\":[{\"rPortWwn\":\"" ARRAY
    "\",\"lunId\":\"0\"}]}",
    "configuration.setAdvancedIoProfile " FC " {\"addedAdvancedIoProfiles\":[{\"note\":1}]}",
    "configuration.clearAdvancedIoProfilesAtPort " FC,
    "configuration.clearAdvancedIoProfilesAtLogicalPort " BEHIND,
    "configuration.clearAdvancedIoProfilesAtRemotePort " BEHIND " " ARRAY,
    "configuration.clearAdvancedIoProfileOfLun " BEHIND " " ARRAY " 1",
    "configuration.resetDataForAdvancedIoAtPPort " FC,
    "configuration.resetDataForAdvancedIoAtLPort " BEHIND,
    "configuration.resetDataForAdvancedIoAtRPort " BEHIND " " ARRAY,
    "configuration.resetDataForAdvancedIoAtLun " BEHIND " " ARRAY " 1",
    "configuration.resetDataForAdvancedIoForLunRange " BEHIND " " ARRAY " 0 2",
    "configuration.createVnic " ETH " 100 200",
    "configuration.modifyVnic " ETH " [{\"pciFunctionIndex\":4,\"minBandwidth\":1,\"maxBandwidth\":2}]",
    "configuration.deleteVnics " ETH " [4]",
    "configuration.resetPortAuthentication " FC,
    "configuration.resetStatisticsForPortAuthentication " FC,
    "configuration.resetStatisticsForPorts [[\"" FC "\",\"" FCOE "\"]]",
    "configuration.resetStatisticsForPort " FC,
    "configuration.resetStatisticsForLPort " BEHIND,
    "configuration.resetStatisticsForVPort " FC " " VPORT,
    "configuration.resetStatisticsForRPort " BEHIND " " ARRAY,
    "configuration.resetStatisticsForFcpim " BEHIND " " ARRAY,
    "configuration.resetStatisticsForIoc " FC,
    "configuration.resetStatisticsForFabric " FC,
    "configuration.resetStatisticsForQos " FC,
    "configuration.resetFirmwareStatistics " HBA,
    "configuration.resetTrunkingStatistics " HBA,
    "configuration.resetLldpStatistics " ETH,
    "configuration.resetIOCEthernetStatistics " ETH,
    "configuration.resetEthernetPortStatistics " ETH,
    "configuration.resetvNICStatistics " ETH,
    "configuration.resetFcoeStatistics " FCOE,
    "configuration.resetvHBAStatistics " FC,
    "configuration.resetStatisticsForFcpimMod " FC,
    "configuration.deleteVPort " FC " [\"" VPORT "\"]",

    "diagnostics.getRequestID",
    "diagnostics.doQuickTest 1 " HBA,
    "diagnostics.doMemoryTest 1 " HBA,
    "diagnostics.doQueueTest 1 " HBA " " FC,
    "diagnostics.doPCILoopbackTest 1 " HBA " " FC " 10 ff 1",
    "diagnostics.dPortEnable 1 " FC " true",
    "diagnostics.getDPortTestResults " FC,
    "diagnostics.doDportTest 1 " HBA " " FC " 10 ff 1",
    "diagnostics.doLoopbackTest 1 " HBA " " FC " 1 8 1 10 ff",
    "diagnostics.doEthLoopbackTest 1 " HBA " " ETH " 1 8 1 10 ff",
    "diagnostics.doLEDTest 1 " HBA " " FC " 1 1 1 1",
    "diagnostics.doEchoTest 1 " HBA " " TARGETS " 1",
    "diagnostics.doFCPingTest 1 " HBA " " TARGETS " 1",
    "diagnostics.doFCTraceRoute 1 " HBA " " TARGETS " 1",
    "diagnostics.startTests 1 false",
    "diagnostics.getDiagnosticsResults 1",
    "diagnostics.doPOSTest 1 " FC " false",
    "diagnostics.doQuickTest 2 " HBA,
    "diagnostics.cancelTests 2",
    "diagnostics.getOpticsPOM " FC,
    "diagnostics.getOpticsSFP " FC,
};

struct Rpc_Outcome
{
    int status;
    std::string out;
    std::string error;
};

class rpc_test : public Module_Fixture
{
protected:
    rpc_test() { simulator.load_file(inventory("demo.json")); }

    static Rpc_Outcome run(std::vector<std::string> arguments)
    {
        arguments.insert(arguments.begin(), {"--module", KLDR_MODULE, "rpc"});
        testing::internal::CaptureStdout();
        testing::internal::CaptureStderr();
        const int status = kldrcim::run_cli(arguments);
        std::fflush(stdout);
        return {status, testing::internal::GetCapturedStdout(), testing::internal::GetCapturedStderr()};
    }

    static Rpc_Outcome run_words(const std::string& line)
    {
        std::istringstream words(line);
        return run({std::istream_iterator<std::string>(words), {}});
    }
};

TEST_F(rpc_test, TheDemoHostAnswersEveryMethod)
{
    std::set<std::string> called;
    std::vector<std::string> words;
    for (const char* call : calls) {
        std::istringstream text(call);
        if (!words.empty())
            words.push_back("+");
        const std::size_t first = words.size();
        words.insert(words.end(), std::istream_iterator<std::string>(text), {});
        called.insert(words[first]);
    }
    const Rpc_Outcome all = run(words);
    EXPECT_EQ(0, all.status) << all.out;
    EXPECT_EQ("", all.error);
    EXPECT_EQ(std::string::npos, all.out.find("\"error\"")) << all.out;
    for (const kldrcim::Rpc_Method& method : kldrcim::rpc_methods())
        EXPECT_TRUE(called.contains(method.name)) << method.name;
}

TEST_F(rpc_test, AResultIsWrittenInLines)
{
    const Rpc_Outcome host = run_words("discovery.getHost");
    EXPECT_EQ(0, host.status);
    EXPECT_EQ("{\n  \"result\": \n  {\n    \"hostManufacturer\": \"KLDR Systems\",\n    \"hostModel\": "
              "\"R200\"\n  }\n}\n",
              host.out);
    EXPECT_EQ("", host.error);
    EXPECT_EQ("null\n", run_words("discovery.getAllPortsByHba 20:00:00:00:00:00:00:00").out);
}

TEST_F(rpc_test, AnErrorIsToldWithItsCode)
{
    const std::pair<const char*, const char*> wrong[] = {
        {"discovery.getPortByWwn", "51 Mismatch in number of parameters."},
        {"discovery.getPortByWwn [7]", "200 Type is not convertible to string"},
        {"configuration.setPortByWwn a b c", "55 Not a JSON Object format."},
        {"configuration.clearLogsForPort a", "54 Not a JSON array format."},
        {"discovery.getPortByWwn nowhere", "2 no such address: null"},
        {"discovery.getCee nowhere", "2 no such address: \"nowhere\""},
        {"discovery.getFcoeByPort a", "105 Procedure not found"},
        {"diagnostics.startTests 77 true", "7 no such request: \"77\""},
    };
    for (const auto& [line, error] : wrong) {
        const Rpc_Outcome refused = run_words(line);
        EXPECT_EQ(1, refused.status) << line;
        EXPECT_EQ("kldrcim: " + std::string(error) + "\n", refused.error) << line;
        EXPECT_EQ("", refused.out) << line;
    }
}

TEST_F(rpc_test, WhatTheLibraryThrowsIsAnErrorToo)
{
    simulator.add_fault(R"({"call": "getCee", "do": "throw", "code": 12, "message": "busy"})");
    EXPECT_EQ("kldrcim: 12 busy\n", run_words("discovery.getCee " ETH).error);
}

TEST_F(rpc_test, CallsOfOneLineAreMadeInOrderUpToTheFirstError)
{
    const Rpc_Outcome line = run_words("discovery.getVPort " FC " " FC " + discovery.getHost");
    EXPECT_EQ(1, line.status);
    EXPECT_EQ("", line.out);
    EXPECT_EQ(0u, simulator.requests("getHost").size());

    const Rpc_Outcome kept =
        run_words("configuration.createVPort " FC " 20:01:02:4b:4c:10:00:00 " VPORT " guest"
                  " + discovery.getAllVPorts " FC " + discovery.getVPort " FC " nowhere");
    EXPECT_EQ(1, kept.status);
    EXPECT_EQ(0u, kept.out.find("{\n  \"status\": 0\n}\n[\n  {\n")) << kept.out;
    EXPECT_EQ("kldrcim: 2 no such address: \"nowhere\"\n", kept.error);
}

TEST_F(rpc_test, ARequestCarriesWhatTheWordsSay)
{
    run_words("configuration.createVnic " ETH " 100 200");
    ASSERT_EQ(1u, simulator.requests("createvNIC").size());
    const Json::Value request = simulator.requests("createvNIC")[0];
    EXPECT_EQ(ETH, request["mac"].asString());
    EXPECT_EQ(100, request["minBandwidth"].asInt());
    EXPECT_EQ(200, request["maxBandwidth"].asInt());
}

TEST_F(rpc_test, ARawTextIsSentAsItIsAndItsReplyWrittenAsItIs)
{
    const Rpc_Outcome broken = run({"--raw", "{"});
    EXPECT_EQ(0, broken.status);
    EXPECT_EQ(0u,
              broken.out.find("There was an error parsing the JSON text comprising the Procedure Call:\n"));
    EXPECT_EQ("", broken.error);
    const Rpc_Outcome unknown = run({"--raw", R"({"id": [7], "method": "nothing"})"});
    EXPECT_EQ(0, unknown.status);
    EXPECT_EQ("{\n   \"error\" : {\n      \"code\" : 105,\n      \"message\" : \"Procedure not found\",\n"
              "      \"name\" : \"JSONRPCError\"\n   },\n   \"id\" : [ 7 ],\n   \"version\" : \"1.1\"\n}\n",
              unknown.out);
    EXPECT_EQ(0u, run({"--raw="}).out.find("There was an error parsing"));
}

TEST_F(rpc_test, TheProductRoadLeavesNothingBehind)
{
    const Rpc_Outcome host = run({"--leaks", "discovery.getHost"});
    EXPECT_NE(std::string::npos, host.error.find("Objects lost: 0")) << host.error;
    EXPECT_EQ(std::string::npos, host.error.find("warning")) << host.error;
}

} // namespace
} // namespace KPRV

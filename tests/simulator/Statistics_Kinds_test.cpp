#include "tests/simulator/Agent_Fixture.h"

#include <atomic>
#include <thread>

namespace KPRV::simulator {
namespace {

#define FC "10:00:02:4b:4c:10:00:00"
#define OTHER_FC "10:00:02:4b:4c:10:00:01"
#define FCOE "10:00:02:4b:4c:20:00:00"
#define OTHER_FCOE "10:00:02:4b:4c:20:00:01"
#define ETH "02:4b:4c:20:00:00"
#define OTHER_ETH "02:4b:4c:20:00:01"
#define VPORT "10:01:02:4b:4c:10:00:00"
#define ARRAY "50:24:b4:c0:00:40:00:01"
#define TAPE "50:24:b4:c0:00:50:00:01"
#define BEHIND "'pPortWwn': '" FC "', 'lPortWwn': '" FC "'"

// What is counted, how that is reset, and something of the same kind that must not be touched.
struct Statistics_Row
{
    const char* get;
    const char* request;
    const char* other;
    const char* reset;
    const char* reset_request;
};

// clang-format off
const Statistics_Row table[] = {
    {"getDynamicFcoeStatistics",         "{'indexStr': '" FCOE "'}",      "{'indexStr': '" OTHER_FCOE "'}",               "resetFcoeStatistics",         "{'indexStr': '" FCOE "'}"},
    {"getDynamicFcpimModStatistics",     "{'indexStr': '" FC "'}",        "{'indexStr': '" OTHER_FC "'}",                 "resetStatisticsForFcpimMod",  "{'indexStr': '" FC "'}"},
    {"getDynamicFirmwareStatistics",     "{'indexStr': '" FC "'}",        "{'indexStr': '" FCOE "'}",                     "resetFirmwareStatistics",     "{'indexStr': '20:00:02:4b:4c:10:00:00'}"},
    {"getDynamicTrunkingStatistics",     "{'indexStr': '" FC "'}",        "{'indexStr': '" FCOE "'}",                     "resetTrunkingStatistics",     "{'indexStr': '" OTHER_FC "'}"},
    {"getDynamicEthernetPortStatistics", "{'mac': '" ETH "'}",            "{'mac': '" OTHER_ETH "'}",                     "resetEthernetPortStatistics", "{'mac': '" ETH "'}"},
    {"getDynamicIOCEthernetStatistics",  "{'mac': '" ETH "'}",            "{'mac': '" OTHER_ETH "'}",                     "resetIOCEthernetStatistics",  "{'mac': '" ETH "'}"},
    {"getDynamicLldpStatistics",         "{'mac': '" ETH "'}",            "{'mac': '" OTHER_ETH "'}",                     "resetLldpStatistics",         "{'mac': '" ETH "'}"},
    {"getDynamicvNICStatistics",         "{'mac': '" ETH "'}",            "{'mac': '" OTHER_ETH "'}",                     "resetvNICStatistics",         "{'mac': '" ETH "'}"},
    {"getDynamicvNICStatisticsForGraph", "{'mac': '" ETH "'}",            "{'mac': '" OTHER_ETH "'}",                     "resetvNICStatistics",         "{'mac': '" ETH "'}"},
    {"getDynamicvHBAStatistics",         "{'wwn': '" FC "'}",             "{'wwn': '" OTHER_FC "'}",                      "resetvHBAStatistics",         "{'wwn': '" FC "'}"},
    {"getDynamicFabricStatistics",       "{'wwn': '" FC "', 'vfID': 0}",  "{'wwn': '" OTHER_FC "', 'vfID': 0}",           "resetStatisticsForFabric",    "{'pwwn': '" FC "', 'vfId': 0}"},
    {"getDynamicIocStatistics",          "{'pwwn': '" FC "'}",            "{'pwwn': '" OTHER_FC "'}",                     "resetStatisticsForIoc",       "{'pwwn': '" FC "'}"},
    {"getDynamicPortAuthStatistics",     "{'pPortWwn': '" FC "'}",        "{'pPortWwn': '" OTHER_FC "'}",                 "resetStatisticsForPortAuth",  "{'wwn': '" FC "'}"},
    {"getDynamicQosStatistics",          "{'pPortWwn': '" FC "'}",        "{'pPortWwn': '" OTHER_FC "'}",                 "resetStatisticsForQos",       "{'pPortWwn': '" FC "'}"},
    {"getDynamicLogicalPortStatistics",  "{" BEHIND ", 'vfId': 0}",       "{'pPortWwn': '" FC "', 'lPortWwn': '" VPORT "', 'vfId': 0}",
                                                                                                                          "resetStatisticsForLPort",     "{'pwwn': '" FC "', 'lwwn': '" FC "', 'vfId': 0}"},
    {"getDynamicFcpimStatistics",        "{" BEHIND ", 'rPortWwn': '" ARRAY "'}",            "{" BEHIND ", 'rPortWwn': '" TAPE "'}",
                                                                                                                          "resetStatisticsForFcpim",     "{" BEHIND ", 'rPortWwn': '" ARRAY "', 'vfId': 0}"},
    {"getDynamicFcpimIopStatistics",     "{" BEHIND ", 'rPortWwn': '" ARRAY "', 'vfId': 0}", "{" BEHIND ", 'rPortWwn': '" TAPE "', 'vfId': 0}",
                                                                                                                          "resetStatisticsForFcpim",     "{" BEHIND ", 'rPortWwn': '" ARRAY "', 'vfId': 0}"},
    {"getDynamicRPortStatistics",        "{" BEHIND ", 'rPortWwn': '" ARRAY "', 'vfId': 0}", "{" BEHIND ", 'rPortWwn': '" TAPE "', 'vfId': 0}",
                                                                                                                          "resetStatisticsForRPort",     "{" BEHIND ", 'rPortWwn': '" ARRAY "', 'vfId': 0}"},
};
// clang-format on

bool all_zero(const Json::Value& counters)
{
    return std::all_of(counters.begin(), counters.end(), [](const Json::Value& each) { return each == "0"; });
}

bool all_decimal(const Json::Value& counters)
{
    return counters.isObject() && !counters.empty() &&
           std::all_of(counters.begin(), counters.end(), [](const Json::Value& each) {
               return each.isString() && each.asString().find_first_not_of("0123456789") == std::string::npos;
           });
}

class Statistics_Kinds_test : public Agent_Fixture
{
};

TEST_F(Statistics_Kinds_test, EachKindCountsAndIsResetForOneThingAlone)
{
    for (const Statistics_Row& row : table) {
        SCOPED_TRACE(row.get);
        simulator.load_file(inventory("demo.json"));
        done("createVport", new_vport());
        const Json::Value before = call(row.get, row.request);
        const Json::Value other = call(row.get, row.other);
        EXPECT_TRUE(all_decimal(before)) << before;
        EXPECT_TRUE(all_decimal(other)) << other;
        EXPECT_FALSE(all_zero(before));
        EXPECT_EQ(call(row.get, row.request), before);
        done(row.reset, row.reset_request);
        const Json::Value after = call(row.get, row.request);
        EXPECT_TRUE(all_zero(after)) << after;
        EXPECT_EQ(after.getMemberNames(), before.getMemberNames());
        EXPECT_EQ(call(row.get, row.other), other);
    }
}

TEST_F(Statistics_Kinds_test, AResetOfOneKindLeavesTheOthersAlone)
{
    const Json::Value ioc = call("getDynamicIocStatistics", "{'pwwn': '" FC "'}");
    done("resetStatisticsForQos", "{'pPortWwn': '" FC "'}");
    EXPECT_EQ(call("getDynamicIocStatistics", "{'pwwn': '" FC "'}"), ioc);
}

TEST_F(Statistics_Kinds_test, AddressesAreFoundInAnyLetterCase)
{
    const Json::Value counters = call("getDynamicQosStatistics", "{'pPortWwn': '" FC "'}");
    EXPECT_EQ(call("getDynamicQosStatistics", "{'pPortWwn': '10:00:02:4B:4C:10:00:00'}"), counters);
}

TEST_F(Statistics_Kinds_test, WhatHasNoSuchCountersIsRefused)
{
    const std::pair<const char*, const char*> wrong[] = {
        {"getDynamicFcoeStatistics", "{'indexStr': '" FC "'}"},
        {"getDynamicFcpimModStatistics", "{'indexStr': '" ETH "'}"},
        {"getDynamicFirmwareStatistics", "{'indexStr': 'nowhere'}"},
        {"getDynamicLldpStatistics", "{'mac': '" FC "'}"},
        {"getDynamicvNICStatistics", "{'mac': '02:4b:4c:20:00:09'}"},
        {"getDynamicFabricStatistics", "{'wwn': '" FC "', 'vfID': 7}"},
        {"getDynamicVPortStatistics", "{" BEHIND ", 'vfId': 0}"},
        {"getDynamicLogicalPortStatistics", "{'pPortWwn': '" FC "', 'lPortWwn': '" VPORT "', 'vfId': 0}"},
        {"getDynamicRPortStatistics", "{" BEHIND ", 'rPortWwn': '50:00:00:00:00:00:00:00', 'vfId': 0}"},
        {"getDynamicAdvancedIoDataAtLun", "{" BEHIND ", 'rPortWwn': '" ARRAY "', 'lunId': '77', 'vfId': 0}"},
        {"getDynamicAdvancedIoDataAtLun", "{" BEHIND ", 'rPortWwn': '" ARRAY "', 'lunId': null, 'vfId': 0}"},
        {"resetStatisticsForLPort", "{'pwwn': '" FC "', 'lwwn': 7, 'vfId': 0}"},
        {"resetvHBAStatistics", "{'wwn': 'nowhere'}"},
    };
    for (const auto& [name, request] : wrong)
        EXPECT_EQ(refused(name, request), ADDRESS) << name << request;
}

TEST_F(Statistics_Kinds_test, AnFcoeFunctionIsFoundByTheMacThatItShares)
{
    EXPECT_EQ(call("getDynamicFcoeStatistics", "{'indexStr': '" ETH "'}"),
              call("getDynamicFcoeStatistics", "{'indexStr': '" FCOE "'}"));
}

TEST_F(Statistics_Kinds_test, WhatIsNewCountsFromZero)
{
    const char* request = "{'pPortWwn': '" FC "', 'lPortWwn': '" VPORT "', 'vfId': 0}";
    done("createVport", new_vport());
    EXPECT_TRUE(all_zero(call("getDynamicVPortStatistics", request)));
    done("resetStatisticsForVPort", "{'pwwn': '" FC "', 'vwwn': '" VPORT "', 'vfId': 0}");
    EXPECT_TRUE(all_zero(call("getDynamicVPortStatistics", request)));
}

class Advanced_Io_Data_test : public Agent_Fixture
{
protected:
    /// Which of port, logical port, remote port and LUNs 0 to 2 have counted something.
    std::string counting()
    {
        const std::string behind = "'pPortWwn': '" FC "', 'lPortWwn': '" FC "'";
        const std::string remote_port = behind + ", 'rPortWwn': '" ARRAY "'";
        std::string seen;
        const auto look = [&](const char* level, const std::string& members, const char* mark) {
            const Json::Value data = call(std::string("getDynamicAdvancedIoDataAt") + level,
                                          ("{" + members + ", 'vfId': 0}").c_str());
            EXPECT_TRUE(all_decimal(data)) << data;
            seen += all_zero(data) ? "-" : mark;
        };
        look("PPort", "'pPortWwn': '" FC "'", "p");
        look("LPort", behind, "l");
        look("RPort", remote_port, "r");
        look("Lun", remote_port + ", 'lunId': '0'", "0");
        look("Lun", remote_port + ", 'lunId': '1'", "1");
        look("Lun", remote_port + ", 'lunId': '2'", "2");
        return seen;
    }

    static constexpr const char* at_lun =
        "{'indexStr': '" FC "', 'lPortWwn': '" FC "', 'rPortWwn': '" ARRAY "'";
};

TEST_F(Advanced_Io_Data_test, AResetTakesInWhatLiesBelow)
{
    const std::string lun = at_lun;
    EXPECT_EQ(counting(), "plr012");
    done("resetDataForAdvIoProf", lun + ", 'lunId': '1'}");
    EXPECT_EQ(counting(), "plr0-2");
    done("resetDataForAdvIoProf", lun + "}");
    EXPECT_EQ(counting(), "pl----");
    done("resetDataForAdvIoProf", "{'indexStr': '" FC "'}");
    EXPECT_EQ(counting(), "------");
}

TEST_F(Advanced_Io_Data_test, ARangeOfLunsIsResetWithBothItsEnds)
{
    const std::string lun = at_lun;
    done("resetDataForAdvIoProf", lun + ", 'lunId': '1', 'endLunRange': '2'}");
    EXPECT_EQ(counting(), "plr0--");
    EXPECT_EQ(refused("resetDataForAdvIoProf", lun + ", 'lunId': '2', 'endLunRange': '0'}"), REQUEST);
    EXPECT_EQ(refused("resetDataForAdvIoProf", lun + ", 'lunId': '0', 'endLunRange': '9'}"), ADDRESS);
    EXPECT_EQ(refused("resetDataForAdvIoProf", lun + ", 'endLunRange': '1'}"), REQUEST);
    EXPECT_EQ(counting(), "plr0--");
}

TEST_F(Statistics_Kinds_test, ThreadsMayCountAndResetAtOnce)
{
    std::atomic<int> bad = 0;
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 4; ++thread)
        threads.emplace_back([&, thread] {
            for (int round = 0; round < 50; ++round) {
                const Statistics_Row& row =
                    table[static_cast<std::size_t>(thread * 50 + round) % std::size(table)];
                bad += call(row.reset, row.reset_request)["status"] != Json::Value(0);
                bad += !all_decimal(call(row.get, row.request));
            }
        });
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(bad, 0);
}

} // namespace
} // namespace KPRV::simulator

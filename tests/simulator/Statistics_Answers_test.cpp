#include "tests/simulator/Simulator_Fixture.h"

#include <chrono>
#include <thread>

namespace KPRV::simulator {
namespace {

using Clock = std::chrono::steady_clock;

class Statistics_Answers_test : public Simulator_Fixture
{
protected:
    Json::Value counters(const std::string& address)
    {
        return call("getDynamicPortStatistics", json("{'indexStr': '" + address + "'}"));
    }

    Json::Value reset(const std::string& address)
    {
        return call("resetStatisticsForPort", json("{'indexStr': '" + address + "'}"));
    }

    /// A host with one port that counts so, and what the port answers.
    Json::Value written(const std::string& statistics, bool fcoe = false)
    {
        simulator.load(json("{'adapters': [{'hbaData': {'wwn': '20:00:02:4b:4c:10:00:00'}, 'fcPorts': ["
                            "{'wwn': '10:00:02:4b:4c:10:00:00', 'isFCoE': " +
                            std::string(fcoe ? "true" : "false") + statistics + "}]}]}"));
        return counters(port);
    }

    std::string value(const std::string& id)
    {
        for (const Json::Value& each : counters(port))
            if (each["id"] == Json::Value(std::stoi(id)))
                return each["value"].asString();
        return "";
    }

    const std::string port = "10:00:02:4b:4c:10:00:00";
};

TEST_F(Statistics_Answers_test, CountersComeInTheirAuthorsOrderAsDecimalText)
{
    EXPECT_EQ(written(", 'statistics': [[1626, 5], [1616, 18446744073709551615], [1, '-7'], [1626, 0]]"),
              json(R"([
        {'id': 1626, 'value': '5'}, {'id': 1616, 'value': '18446744073709551615'}, {'id': 1, 'value': '-7'},
        {'id': 1626, 'value': '0'}])"));
}

TEST_F(Statistics_Answers_test, ByDefaultAPortCountsWhatItsKindCountsFromZero)
{
    const auto ids = [](const Json::Value& answer) {
        std::vector<int> list;
        for (const Json::Value& each : answer) {
            EXPECT_EQ(each["value"], "0");
            list.push_back(each["id"].asInt());
        }
        return list;
    };
    EXPECT_EQ(ids(written("")), (std::vector<int>{1401, 1402, 1403, 1404, 1409, 1410, 1411, 1412, 1416, 1421,
                                                  1422, 1423, 1424, 1425, 1426, 1427, 1428}));
    EXPECT_EQ(ids(written("", true)),
              (std::vector<int>{1601, 1602, 1614, 1615, 1616, 1624, 1625, 1626, 1627, 1628}));
}

TEST_F(Statistics_Answers_test, APortMayTellNothing)
{
    EXPECT_EQ(written(", 'statistics': null"), json("[]"));
    EXPECT_EQ(written(", 'statistics': []"), json("[]"));
}

TEST_F(Statistics_Answers_test, FiguresStandStillUnlessTheirAuthorLetsThemGrow)
{
    const auto before = Clock::now();
    written(", 'statistics': [[1402, 1000], [1403, 1000, 1000000]]");
    const auto after = Clock::now();
    std::this_thread::sleep_for(std::chrono::milliseconds(30));
    const auto milliseconds = [](Clock::duration time) {
        return std::chrono::duration_cast<std::chrono::milliseconds>(time).count();
    };
    const long long least = 1000 + 1000 * milliseconds(Clock::now() - after);
    const long long grown = std::stoll(value("1403"));
    EXPECT_GE(grown, least);
    EXPECT_LE(grown, 1000 + 1000 * (milliseconds(Clock::now() - before) + 1));
    EXPECT_EQ(value("1402"), "1000");
}

TEST_F(Statistics_Answers_test, ResettingSetsAllCountersOfThePortToZero)
{
    simulator.load_file(inventory("rich.json"));
    const Json::Value other = counters("10:00:02:4b:4c:a2:00:00");
    const Json::Value before = counters("10:00:02:4b:4c:a1:00:00");
    EXPECT_EQ(reset("10:00:02:4b:4c:a1:00:00"), json("{'status': 0}"));
    const Json::Value after = counters("10:00:02:4b:4c:a1:00:00");
    ASSERT_EQ(after.size(), before.size());
    for (Json::ArrayIndex index = 0; index < after.size(); ++index) {
        EXPECT_EQ(after[index]["id"], before[index]["id"]);
        EXPECT_NE(before[index]["value"], "0");
        EXPECT_EQ(after[index]["value"], "0");
    }
    EXPECT_EQ(counters("10:00:02:4b:4c:a2:00:00"), other);
}

TEST_F(Statistics_Answers_test, WhatGrowsGoesOnGrowingAfterAReset)
{
    written(", 'statistics': [[1, 'many'], [2, 18446744073709551615, 4000000000]]");
    reset(port);
    const unsigned long long first = std::stoull(value("2"));
    std::this_thread::sleep_for(std::chrono::milliseconds(5));
    EXPECT_GT(std::stoull(value("2")), first);
    EXPECT_EQ(value("1"), "0");
}

TEST_F(Statistics_Answers_test, OnlyFcPortsHaveThem)
{
    simulator.load_file(inventory("demo.json"));
    for (const char* address : {"02:4b:4c:20:00:00", "20:00:02:4b:4c:10:00:00", "nowhere"}) {
        EXPECT_EQ(error_code(counters(address)), 2) << address;
        EXPECT_EQ(error_code(reset(address)), 2) << address;
    }
}

} // namespace
} // namespace KPRV::simulator

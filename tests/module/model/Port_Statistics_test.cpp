#include "module/model/Port_Statistics.h"

#include "tests/module/model/Port_Fixture.h"

using namespace KPRV;

namespace {

struct Port_Statistics : Port_Fixture
{
    void counters(const std::vector<std::pair<int, const char*>>& entries)
    {
        Json::Value answer = Json::arrayValue;
        for (const auto& [id, value] : entries) {
            Json::Value entry;
            entry["id"] = id;
            entry["value"] = value;
            answer.append(entry);
        }
        library.answers("getDynamicPortStatistics", answer);
    }
    void is_fcoe() { library.answers("getPortByWwn", with(fc_port(), "isFCoE", true)); }
    /// All that is set, without the two names.
    Set_Properties read()
    {
        Set_Properties set = walk(FCPORTSTATISTICS).at(0);
        EXPECT_EQ(set["InstanceID"], "10008c7cff000001");
        EXPECT_EQ(set["ElementName"], "FC Port Statistics");
        set.erase("InstanceID");
        set.erase("ElementName");
        return set;
    }
};

const std::pair<int, const char*> fc_ids[] = {
    {1402, "PacketsTransmitted"},
    {1403, "BytesTransmitted"},
    {1409, "PacketsReceived"},
    {1410, "BytesReceived"},
    {1411, "LIPCount"},
    {1412, "NOSCount"},
    {1416, "CRCErrors"},
    {1421, "ErrorFrames"},
    {1422, "DumpedFrames"},
    {1423, "LinkFailures"},
    {1424, "LossOfSyncCounter"},
    {1425, "LossOfSignalCounter"},
    {1426, "PrimitiveSeqProtocolErrCount"},
    {1428, "InvalidTransmissionWords"},
};

Set_Properties zeros()
{
    Set_Properties set;
    for (const auto& [id, name] : fc_ids)
        set[name] = "0";
    return set;
}

} // namespace

TEST_F(Port_Statistics, EachCounterOfAnFcPort)
{
    for (const auto& [id, name] : fc_ids) {
        counters({{1, "5"}, {id, "12345678901"}, {1616, "7"}});
        Set_Properties expected = zeros();
        expected[name] = "12345678901";
        EXPECT_EQ(read(), expected) << id;
    }
    EXPECT_EQ(library.told()[3], R"(getDynamicPortStatistics {"indexStr":"10:00:8c:7c:ff:00:00:01"})");
}

TEST_F(Port_Statistics, AnFcoePortCountsErrorsOnly)
{
    is_fcoe();
    counters({{1615, "1"},
              {1616, "2"},
              {1624, "4"},
              {1625, "8"},
              {1627, "16"},
              {1628, "32"},
              {1402, "99"},
              {1411, "99"},
              {1421, "99"}});
    Set_Properties expected = zeros();
    expected["ErrorFrames"] = "59";
    expected["DumpedFrames"] = "4";
    expected["CRCErrors"] = "2";
    EXPECT_EQ(read(), expected);
}

TEST_F(Port_Statistics, TwoIdsWriteOneCounterOfAnFcoePort)
{
    is_fcoe();
    counters({{1616, "2"}, {1626, "3"}});
    EXPECT_EQ(read()["CRCErrors"], "3");
    counters({{1626, "3"}, {1616, "2"}});
    EXPECT_EQ(read()["CRCErrors"], "2");
    EXPECT_EQ(read()["ErrorFrames"], "2");
}

TEST_F(Port_Statistics, ValuesAreReadAsFarAsTheyAreDecimal)
{
    const std::pair<const char*, const char*> values[] = {
        {"9223372036854775807", "9223372036854775807"},
        {"99999999999999999999", "9223372036854775807"},
        {"-1", "18446744073709551615"},
        {" 12x", "12"},
        {"x", "0"},
        {"", "0"},
    };
    for (const auto& [text, expected] : values) {
        counters({{1411, text}});
        EXPECT_EQ(read()["LIPCount"], expected) << text;
    }
}

TEST_F(Port_Statistics, ElementsThatAreNoneAreSkipped)
{
    library.answers("getDynamicPortStatistics",
                    json("[5, null, {}, {'id': null}, {'id': 1, 'value': 7}, {'id': 1411}]"));
    EXPECT_EQ(read(), zeros());
}

TEST_F(Port_Statistics, WrongTypesLoseThePort)
{
    library.answers("getDynamicPortStatistics", json("[{'id': 'x', 'value': '1'}]"));
    EXPECT_TRUE(walk(FCPORTSTATISTICS).empty());
    library.answers("getDynamicPortStatistics", json("[{'id': 1411, 'value': 1}]"));
    EXPECT_TRUE(walk(FCPORTSTATISTICS).empty());
    EXPECT_EQ(
        log.said("ERR"),
        (Lines{"ERR libGetDynamicPortStatisticsat got std exception: Type is not convertible to int",
               "ERR libGetDynamicPortStatisticsat got std exception: Type is not convertible to string"}));
}

TEST_F(Port_Statistics, BadAnswers)
{
    for (const char* answer : {"null", "{'error': 1}", "{}", "[]", "5"}) {
        library.answers("getDynamicPortStatistics", json(answer));
        EXPECT_TRUE(walk(FCPORTSTATISTICS).empty()) << answer;
    }
    EXPECT_EQ(log.said("WARN"),
              Lines(5, "WARN libGetDynamicPortStatistics failed for port WWN= 10008c7cff000001"));
    EXPECT_EQ(log.said("ERR"), Lines{});
}

TEST_F(Port_Statistics, ExceptionsAreToldUnderAMisspeltName)
{
    library.throws("getDynamicPortStatistics", HbaAgentError{7, "busy"});
    EXPECT_TRUE(walk(FCPORTSTATISTICS).empty());
    library.throws("getDynamicPortStatistics", std::runtime_error("broken"));
    EXPECT_TRUE(walk(FCPORTSTATISTICS).empty());
    library.throws("getDynamicPortStatistics", 5);
    EXPECT_TRUE(walk(FCPORTSTATISTICS).empty());
    EXPECT_EQ(log.said("ERR"), (Lines{"ERR libGetDynamicPortStatisticsat got User exception 7: busy",
                                      "ERR libGetDynamicPortStatisticsat got std exception: broken",
                                      "ERR libGetDynamicPortStatisticsat got default exception"}));
    EXPECT_EQ(log.said("WARN"), Lines{});
}

// One event on its way: which alerts it gives, and what the log says of it.
#include "tests/module/alerts/Event_Fixture.h"

#include "module/adapter/Json_Access.h"
#include "tests/support/Live_Blocks.h"

namespace KPRV {
namespace {

using Texts = std::vector<std::string>;

class Processed_Events : public Event_Fixture
{
};

TEST_F(Processed_Events, GiveAlertsByCategoryAndId)
{
    // Ids from 0 to 16, by category: s standard and proprietary, p proprietary only, . nothing.
    const std::map<int, std::string> expected = {
        {-1, "sssssssssssssssss"}, {0, "sssssssssssssssss"},  {1, "................."},
        {2, ".ss.ssssssssssss."},  {3, ".ss.............."},  {4, ".ppppp..........."},
        {5, ".ppp............."},  {6, "................."},  {7, "................."},
        {8, ".ss.............."},  {9, ".ppppppppp......."},  {10, ".ssss............"},
        {11, "................."}, {12, "................."}, {13, "sssssssssssssssss"},
        {99, "sssssssssssssssss"}};
    for (const auto& [category, kinds] : expected) {
        std::string found;
        for (int id = 0; id <= 16; id++) {
            const Texts ids = texts_of(alerts_of(category, id), "MessageID");
            found += ids.size() == 2 ? 's' : ids.size() == 1 ? 'p' : '.';
            for (const std::string& each : ids)
                EXPECT_EQ(&each == &ids.back(), each.starts_with("PROP")) << each;
        }
        EXPECT_EQ(kinds, found) << "category " << category;
    }
    for (const int id : {-1, 31, 32, 33, 65536 + 1, INT32_MAX, INT32_MIN})
        for (const int category : {2, 3, 4, 5, 8, 9, 10})
            EXPECT_TRUE(alerts_of(category, id).empty()) << category << "/" << id;
}

// Each alert has an owner from its making until the queue has it.
TEST_F(Processed_Events, LoseNoAlertThatIsBeingMade)
{
    const auto forget = [&] {
        take_alerts(helper);
        log.clear();
        library.calls.clear();
    };
    for (const int category : {2, 4, 9, 99}) {
        const std::string event = text(category, 1);
        EXPECT_EQ("", lost_without_a_block(
                          [&] {
                              helper.processEvent(event.c_str());
                              take_alerts(helper);
                          },
                          forget))
            << category;
    }
}

TEST_F(Processed_Events, BearTheMessageIdsOfTheirKeys)
{
    for (const int category : {2, 3, 8, 10}) {
        const std::string id = "KLDR" + std::to_string(category * 65536 + 1);
        EXPECT_EQ((Texts{id, "PROP" + id}), texts_of(alerts_of(category, 1), "MessageID"));
    }
    for (const int category : {4, 5, 9})
        EXPECT_EQ(Texts{"PROPKLDR" + std::to_string(category * 65536 + 1)},
                  texts_of(alerts_of(category, 1), "MessageID"));
    EXPECT_EQ((Texts{"PLAT260", "PROPKLDR655363"}), texts_of(alerts_of(10, 3), "MessageID"));
    EXPECT_EQ((Texts{"PLAT261", "PROPKLDR655364"}), texts_of(alerts_of(10, 4), "MessageID"));
    EXPECT_EQ((Texts{"Unknown", "PROPUnknown"}), texts_of(alerts_of(0, 1), "MessageID"));
}

TEST_F(Processed_Events, SetTheseProperties)
{
    const std::vector<Alert> alerts =
        alerts_of(2, 1, R"("eventSeverity": 2, "portIndexString": "1000024b4c100000",
                           "eventMsg": "up again", "eventIdValue": "ZNT_PORT_ONLINE")");
    ASSERT_EQ(2u, alerts.size());
    Set_Properties standard = set_properties(alerts[0].ptr());
    for (const char* time : {"EventTime", "IndicationTime"}) {
        EXPECT_EQ(25u, standard[time].size());
        EXPECT_EQ('.', standard[time][14]);
        standard.erase(time);
    }
    standard.erase("SequenceNumber");
    const std::string port = port_path("KALDERA_FCPort", "1000024b4c100000");
    Set_Properties expected = {{"AlertingElementFormat", "2"},
                               {"AlertingManagedElement", port},
                               {"AlertType", "1"},
                               {"Category", "Port"},
                               {"Description", "Base port logged into Fabric."},
                               {"EventID", "ZNT_PORT_ONLINE"},
                               {"IndicationIdentifier", "ZNT_PORT_ONLINE"},
                               {"Message", "up again"},
                               {"MessageArguments", "{1000024b4c100000}"},
                               {"MessageID", "KLDR131073"},
                               {"OtherAlertType", "Port"},
                               {"OwningEntity", "KALDERA"},
                               {"PerceivedSeverity", "6"},
                               {"ProbableCause", "1"},
                               {"ProbableCauseDescription", "Base port logged into Fabric."},
                               {"ProviderName", "kldrprovider"},
                               {"RecommendedActions", "{No action required.}"},
                               {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                               {"SystemName", "10.0.0.1"}};
    EXPECT_EQ(expected, standard);
    Set_Properties proprietary = set_properties(alerts[1].ptr());
    EXPECT_EQ(text_of(alerts[0], "EventTime"), proprietary["EventTime"]);
    for (const char* own : {"EventTime", "IndicationTime", "SequenceNumber"})
        proprietary.erase(own);
    expected["MessageID"] = "PROPKLDR131073";
    expected["PerceivedSeverity"] = "5";
    EXPECT_EQ(expected, proprietary);
}

TEST_F(Processed_Events, TellOfTheirElement)
{
    struct
    {
        int category;
        const char* name;
        std::string path;
    } const rows[] = {{2, "Port", port_path("KALDERA_FCPort", "aa:bb")},
                      {3, "Lport", port_path("KALDERA_FCPort", "ccdd")},
                      {4, "Rport", port_path("KALDERA_FCPort", "ccdd")},
                      {5, "ITNIM", port_path("KALDERA_FCPort", "ccdd")},
                      {8, "Audit", port_path("KALDERA_FCPort", "aa:bb")},
                      {9, "IOC", port_path("KALDERA_FCPort", "ccdd")},
                      {10, "EthPort", port_path("KALDERA_EthernetPort", "aa:bb")}};
    for (const auto& row : rows) {
        // Colons go from the base port's address only.
        const Alert alert =
            alerts_of(row.category, 1, R"("portIndexString": "aa:bb", "basePortWWN": "cc:dd")").front();
        EXPECT_EQ(row.path, text_of(alert, "AlertingManagedElement"));
        EXPECT_EQ(row.name, text_of(alert, "Category"));
        EXPECT_EQ(row.name, text_of(alert, "OtherAlertType"));
    }
}

TEST_F(Processed_Events, OfUnknownCategoriesTellOfNothing)
{
    for (const int category : {0, 13, -1, INT32_MAX, INT32_MIN}) {
        const std::vector<Alert> alerts = alerts_of(category, 1, R"("portIndexString": "aa")");
        ASSERT_EQ(2u, alerts.size());
        for (const Alert& alert : alerts) {
            for (const char* name : {"AlertingManagedElement", "Category", "OtherAlertType"})
                EXPECT_EQ("(null)", text_of(alert, name)) << name;
            EXPECT_EQ("Unknown", text_of(alert, "Description"));
            EXPECT_EQ("Unknown", text_of(alert, "ProbableCauseDescription"));
            EXPECT_EQ("{Unknown}", text_of(alert, "RecommendedActions"));
            EXPECT_EQ("{}", text_of(alert, "MessageArguments"));
        }
    }
}

TEST_F(Processed_Events, HaveTheseMessageArguments)
{
    const std::string all = R"("portIndexString": "aa", "basePortWWN": "bb", "pomLevel": "high",
                               "fWwn": "20:00", "cee_state": "linkup")";
    const std::string few = R"("portIndexString": "aa")";
    const auto arguments = [&](int category, int id, const std::string& more) {
        const Texts texts = texts_of(alerts_of(category, id, more), "MessageArguments");
        EXPECT_EQ(texts.front(), texts.back());
        return texts.front();
    };
    for (const int id : {1, 2, 4, 5, 7, 8, 9, 10, 11, 12, 14, 15})
        EXPECT_EQ("{aa}", arguments(2, id, all));
    EXPECT_EQ("{high, aa}", arguments(2, 6, all));
    EXPECT_EQ("{aa}", arguments(2, 6, few));
    EXPECT_EQ("{, aa}", arguments(2, 6, few + R"(, "pomLevel": null)"));
    EXPECT_EQ("{aa, 20:00}", arguments(2, 13, all));
    EXPECT_EQ("{aa}", arguments(2, 13, few));
    EXPECT_EQ(1u, alerts_of(2, 1).at(0)->MessageArguments.value.size()) << "one empty text";
    for (const int id : {1, 2}) {
        EXPECT_EQ("{}", arguments(3, id, all));
        EXPECT_EQ("{aa}", arguments(8, id, all));
    }
    for (int id = 1; id <= 5; id++)
        EXPECT_EQ("{}", arguments(4, id, all));
    for (int id = 1; id <= 3; id++)
        EXPECT_EQ("{}", arguments(5, id, all));
    for (int id = 1; id <= 9; id++)
        EXPECT_EQ("{}", arguments(9, id, all));
    EXPECT_EQ("{linkup}", arguments(10, 1, all));
    EXPECT_EQ("{}", arguments(10, 1, few));
    EXPECT_EQ("{aa}", arguments(10, 2, all));
}

TEST_F(Processed_Events, HaveTheirSeverityByKindAndEvent)
{
    const auto severities = [&](int category, int id, int severity) {
        return texts_of(alerts_of(category, id, R"("eventSeverity": )" + std::to_string(severity)),
                        "PerceivedSeverity");
    };
    const std::map<int, Texts> by_input = {{1, {"6", "6"}}, {2, {"6", "5"}}, {3, {"3", "3"}}, {4, {"2", "2"}},
                                           {0, {"0", "0"}}, {5, {"0", "0"}}, {-7, {"0", "0"}}};
    for (const auto& [input, both] : by_input) {
        for (const auto& [category, id] : {std::pair{2, 1}, {8, 2}, {10, 1}, {0, 1}})
            EXPECT_EQ(both, severities(category, id, input)) << category << "/" << id << " " << input;
        for (const int category : {4, 5, 9})
            EXPECT_EQ(Texts{both[1]}, severities(category, 1, input));
        // Fixed for the standard alert only.
        EXPECT_EQ((Texts{"2", both[1]}), severities(3, 1, input));
        EXPECT_EQ((Texts{"2", both[1]}), severities(3, 2, input));
        EXPECT_EQ((Texts{"6", both[1]}), severities(10, 2, input));
        EXPECT_EQ((Texts{"2", both[1]}), severities(10, 3, input));
        EXPECT_EQ((Texts{"3", both[1]}), severities(10, 4, input));
    }
}

TEST_F(Processed_Events, OfASwitchedEthernetPortFollowTheRegistry)
{
    library.answers("getEthPortByEthMac", json("{'ethData': {'ethDev': 'eth2'}}"));
    const std::string more =
        R"("portIndexString": "024b4c200000", "eventMsg": "as told", "eventSeverity": 1)";
    const std::string system = "//10.0.0.1/root/kaldera:KALDERA_ComputerSystem."
                               "Name=\"10.0.0.1\",CreationClassName=\"KALDERA_ComputerSystem\"";
    for (const auto& [id, word] : {std::pair{3, "enabled"}, {4, "disabled"}}) {
        library.calls.clear();
        const std::vector<Alert> alerts = alerts_of(10, id, more);
        ASSERT_EQ(2u, alerts.size());
        EXPECT_EQ(Lines{R"(getEthPortByEthMac {"mac":"02:4b:4c:20:00:00"})"}, library.told());
        EXPECT_EQ((Texts{std::string("The network port eth2 has been ") + word, "as told"}),
                  texts_of(alerts, "Message"));
        EXPECT_EQ((Texts{"DMTF", "KALDERA"}), texts_of(alerts, "OwningEntity"));
        for (const Alert& alert : alerts) {
            EXPECT_EQ("{eth2, " + system + "}", text_of(alert, "MessageArguments"));
            EXPECT_EQ("2", text_of(alert, "AlertType"));
            EXPECT_EQ("", text_of(alert, "OtherAlertType"));
            EXPECT_EQ("EthPort", text_of(alert, "Category"));
        }
    }
}

TEST_F(Processed_Events, OfAnEthernetPortWithoutADeviceStillGoOut)
{
    for (const Json::Value& answer : {Json::Value(), json("{'error': {}}"), json("{'ethData': {}}"),
                                      json("{'ethData': {'ethDev': 7}}")}) {
        library.answers("getEthPortByEthMac", answer);
        const std::vector<Alert> alerts = alerts_of(10, 3, R"("portIndexString": "024b4c200000")");
        ASSERT_EQ(2u, alerts.size());
        EXPECT_EQ("The network port  has been enabled", text_of(alerts[0], "Message"));
        EXPECT_EQ(0u, text_of(alerts[0], "MessageArguments").find("{, //10.0.0.1/"));
        EXPECT_TRUE(log.has("ERR Unable to get Eth Device Name for 024b4c200000"));
        log.clear();
    }
    library.throws("getEthPortByEthMac", HbaAgentError{7, "busy"});
    EXPECT_EQ(2u, alerts_of(10, 4, R"("portIndexString": "024b4c200000")").size());
    EXPECT_EQ(2u, alerts_of(10, 4).size()) << "no port at all";
}

TEST_F(Processed_Events, OfAnEthernetPortThatIsNotNamedBlameNoCallThatWasNotMade)
{
    for (const char* port : {"", R"("portIndexString": "")", R"("portIndexString": "8")"}) {
        library.calls.clear();
        log.clear();
        const std::vector<Alert> alerts = alerts_of(10, 3, port);
        ASSERT_EQ(2u, alerts.size()) << port;
        EXPECT_EQ("The network port  has been enabled", text_of(alerts[0], "Message"));
        EXPECT_TRUE(library.calls.empty());
        for (const std::string& line : log.said("ERR"))
            EXPECT_EQ(std::string::npos, line.find("libGetEthPortByEthMac")) << line;
    }
}

TEST_F(Processed_Events, OfADeviceWithALongNameAreCut)
{
    library.answers("getEthPortByEthMac", json("{'ethData': {'ethDev': '" + std::string(400, 'e') + "'}}"));
    const std::vector<Alert> alerts = alerts_of(10, 3, R"("portIndexString": "024b4c200000")");
    EXPECT_EQ("The network port " + std::string(255 - 17, 'e'), text_of(alerts[0], "Message"));
}

TEST_F(Processed_Events, OfNoSymbolHaveEmptyIds)
{
    for (const char* symbol : {"", R"("eventIdValue": "PORT_ONLINE")"}) {
        const Alert alert = alerts_of(2, 1, symbol).front();
        EXPECT_EQ("", text_of(alert, "EventID"));
        EXPECT_EQ("", text_of(alert, "IndicationIdentifier"));
        EXPECT_EQ("", text_of(alert, "Message"));
    }
}

TEST_F(Processed_Events, AreToldToTheLog)
{
    alerts_of(2, 1, R"("eventSeverity": 4)");
    EXPECT_EQ((Lines{"WARN Before event category switch : 2", "WARN Event ID  : 1",
                     "INFO Message ID = KLDR131073", "INFO Updating kldrIndication"}),
              log.said());
    const Lines traces = log.traces();
    EXPECT_EQ("DBG Entering: processEvent", traces.front());
    EXPECT_EQ("DBG Returning: processEvent", traces.back());

    log.clear();
    alerts_of(2, 1);
    const std::string severity = "WARN Received a un-expected severity value: 0";
    EXPECT_EQ((Lines{severity, "WARN Before event category switch : 2", "WARN Event ID  : 1", severity}),
              log.said("WARN"));
}

TEST_F(Processed_Events, ThatAreNotAcceptedAreToldToTheLog)
{
    const std::map<int, Lines> words = {{1, {}},
                                        {2, {"Unsupported event-port is triggered."}},
                                        {3, {"Not supported event is triggered."}},
                                        {4, {"Non supported event by regular provider is triggered."}},
                                        {5, {"Non supported event by regular provider is triggered."}},
                                        {6, {}},
                                        {7, {}},
                                        {8, {"unsupported eventr-audit is triggered."}},
                                        {9, {"Not supported event is triggered."}},
                                        {10, {"Not supported event is triggered."}},
                                        {11, {}},
                                        {12, {}}};
    for (const auto& [category, refusal] : words) {
        log.clear();
        EXPECT_TRUE(alerts_of(category, 17, R"("eventSeverity": 4)").empty());
        Lines expected = {"WARN Before event category switch : " + std::to_string(category),
                          "WARN Event ID  : 17"};
        for (const std::string& each : refusal)
            expected.push_back("WARN " + each);
        expected.push_back("WARN Invoked with a unsporrted or invalid event");
        EXPECT_EQ(expected, log.said("WARN"));
        EXPECT_FALSE(log.has("INFO Updating kldrIndication"));
        for (const std::string& trace : log.traces())
            EXPECT_NE("DBG Returning: processEvent", trace);
    }
    log.clear();
    alerts_of(2, 3, R"("eventSeverity": 4)");
    EXPECT_EQ("INFO Message ID = KLDR131075", log.said("INFO").at(0)) << "known, and refused all the same";
    log.clear();
    alerts_of(4, 1, R"("eventSeverity": 4)");
    EXPECT_EQ("WARN Non supported event by regular provider is triggered.", log.said("WARN").at(2))
        << "of accepted ones too";
}

TEST_F(Processed_Events, ThatAreMalformedGiveNothing)
{
    for (const char* text : {"", "no json", "[]", "{}", R"({"eventCategory": 2})"}) {
        log.clear();
        EXPECT_TRUE(alerts_of(text).empty());
        EXPECT_EQ(1u, log.said().size()) << text;
        EXPECT_EQ(Lines{"DBG Entering: processEvent"}, log.traces());
    }
}

TEST_F(Processed_Events, OfWrongTypesThrowThroughTheCallback)
{
    const char* text = R"({"eventCategory": "2", "eventId": 1})";
    EXPECT_THROW(helper.processEvent(text), Not_Convertible);
    EXPECT_THROW(providerHandleEvent(text), Not_Convertible);
    EXPECT_THROW(providerHandleEvent(R"({"eventCategory": 2, "eventId": 1, "eventMsg": []})"),
                 std::runtime_error);
    EXPECT_TRUE(take_alerts(gIndicationHelperObj).empty());
}

TEST_F(Processed_Events, ReachTheOneHelperThroughTheCallback)
{
    providerHandleEvent(text(2, 1).c_str());
    EXPECT_EQ(2u, take_alerts(gIndicationHelperObj).size());
    EXPECT_EQ(&gIndicationHelperObj, IndicationHelper::getIndicationHelperInstance());
}

TEST_F(Processed_Events, AreUnknownWhileTheCatalogueIsEmpty)
{
    IndicationHelper fresh;
    EXPECT_EQ(1, fresh.processEvent(text(10, 3).c_str()));
    const std::vector<Alert> alerts = take_alerts(fresh);
    EXPECT_EQ((Texts{"Unknown", "PROPKLDR655363"}), texts_of(alerts, "MessageID"));
    EXPECT_EQ((Texts{"Unknown", "Unknown"}), texts_of(alerts, "Description"));
    EXPECT_EQ((Texts{"{Unknown}", "{Unknown}"}), texts_of(alerts, "RecommendedActions"));
}

} // namespace
} // namespace KPRV

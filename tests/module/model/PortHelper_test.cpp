#include "module/model/PortHelper.h"

#include "tests/module/model/Port_Fixture.h"

using namespace KPRV;

using PortHelper_Walk = Port_Fixture;

TEST_F(PortHelper_Walk, OnePort)
{
    EXPECT_EQ(walk(FCPORT), (std::vector<Set_Properties>{{
                                {"CreationClassName", "KALDERA_FCPort"},
                                {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                                {"SystemName", "10.0.0.1"},
                                {"DeviceID", "10008c7cff000001"},
                                {"PermanentAddress", "10008c7cff000001"},
                                {"ElementName", "20008c7cff000001:10008c7cff000001"},
                                {"Name", "20008c7cff000001:10008c7cff000001"},
                                {"Caption", "a port"},
                                {"OperationalStatus", "{11}"},
                                {"UsageRestriction", "3"},
                                {"PortType", "10"},
                                {"LinkTechnology", "4"},
                                {"Speed", "8000000000"},
                                {"MaxSpeed", "16000000000"},
                                {"SupportedMaximumTransmissionUnit", "2112"},
                                {"PortNumber", "0"},
                                {"EnabledState", "2"},
                                {"EnabledDefault", "2"},
                            }}));
    EXPECT_EQ(library.told(), (Lines{"getAllAdaptersIndexString null",
                                     R"(getFcPhyPortIndicesByAdapter {"indexStr":"20:00:8c:7c:ff:00:00:00"})",
                                     R"(getPortByWwn {"wwn":"10:00:8c:7c:ff:00:00:01"})"}));
    EXPECT_EQ(log.said(), Lines{"DBG numOfPorts = 1"});
    EXPECT_EQ(log.traces().front(), "DBG Entering: getInstancesByClass");
    EXPECT_EQ(log.traces()[1], "DBG Entering: getInstancesByAdapterId");
}

TEST_F(PortHelper_Walk, PortsAreNumberedByTheirPlaceAndJoinedInOrder)
{
    library.answers("getAllAdaptersIndexString", list_of({"AA", "BB", "CC"}));
    library.answers("getFcPhyPortIndicesByAdapter", [](const Json::Value& request) {
        if (request["indexStr"] == "BB")
            return json("{'error': 'gone'}");
        return request["indexStr"] == "AA" ? list_of({"1", "2", "3"}) : list_of({"4"});
    });
    library.answers("getPortByWwn", [](const Json::Value& request) {
        return request["wwn"] == "2" ? Json::Value() : fc_port(request["wwn"] == "1" ? "01" : "0x");
    });
    EXPECT_EQ(walk(FCPORT, "PortNumber"), (Lines{"0", "2", "0"}));
    EXPECT_EQ(walk(FCPORT, "DeviceID"), (Lines{"01", "0x", "0x"}));
    // A port that cannot be read is dropped without a word.
    EXPECT_EQ(log.said("ERR"), Lines(2, "ERR libGetFcPhyPortIndicesByAdapter returns NULL."));
}

TEST_F(PortHelper_Walk, AHoleInTheListKeepsItsNumber)
{
    Json::Value list;
    list["indexStrings"][1] = PORT;
    library.answers("getFcPhyPortIndicesByAdapter", list);
    library.answers("getPortByWwn", [](const Json::Value& request) {
        return request["wwn"] == PORT ? fc_port() : Json::Value();
    });
    EXPECT_EQ(walk(FCPORT, "PortNumber"), Lines{"1"});
}

TEST_F(PortHelper_Walk, Speeds)
{
    const std::pair<Json::Value, const char*> operating[] = {
        {99999, "0"}, {8, "8000000000"}, {0, "0"}, {Json::Value(), "0"}, {100, "100000000000"}};
    for (const auto& [value, expected] : operating) {
        library.answers("getPortByWwn", with(fc_port(), "operatingSpeed", value));
        EXPECT_EQ(walk(FCPORT, "Speed"), Lines{expected}) << value;
    }
    // Only the operating speed knows a value for unknown.
    const std::pair<const char*, const char*> supported[] = {
        {"[99999]", "99999000000000"}, {"[32]", "32000000000"}, {"[]", "0"}, {"null", "0"}, {"'x'", "0"}};
    for (const auto& [value, expected] : supported) {
        library.answers("getPortByWwn", with(fc_port(), "supportedPortSpeeds", json(value)));
        EXPECT_EQ(walk(FCPORT, "MaxSpeed"), Lines{expected}) << value;
    }
}

TEST_F(PortHelper_Walk, NumbersKeepTheirSignUntilTheyArePublished)
{
    Json::Value answer = with(fc_port(), "maxFrameSize", -1);
    answer["portStatusValue"] = -1;
    answer["portTypeMOFValue"] = 65537;
    library.answers("getPortByWwn", answer);
    Set_Properties set = walk(FCPORT)[0];
    EXPECT_EQ(set["SupportedMaximumTransmissionUnit"], "18446744073709551615");
    EXPECT_EQ(set["OperationalStatus"], "{65535}");
    EXPECT_EQ(set["EnabledState"], "1");
    EXPECT_EQ(set["PortType"], "1");
}

TEST_F(PortHelper_Walk, AnEmptyAnswerIsAPortWithoutData)
{
    for (const char* answer : {"{}", "[]", "5", "'x'"}) {
        library.answers("getPortByWwn", json(answer));
        Set_Properties set = walk(FCPORT).at(0);
        EXPECT_EQ(set["DeviceID"], "") << answer;
        EXPECT_EQ(set["Name"], ":");
        EXPECT_EQ(set["EnabledState"], "1");
        EXPECT_EQ(set["SystemName"], "10.0.0.1");
    }
}

TEST_F(PortHelper_Walk, TextsAreCutToTheRecord)
{
    const std::string text(2000, 'x');
    Json::Value answer = fc_port(text.c_str());
    answer["nodeWwn"] = answer["PortSymbolicName"] = text;
    library.answers("getPortByWwn", answer);
    Set_Properties set = walk(FCPORT).at(0);
    const std::string wwn = text.substr(0, 23);
    EXPECT_EQ(set["DeviceID"], wwn);
    EXPECT_EQ(set["Name"], wwn + ":" + wwn);
    EXPECT_EQ(set["Caption"], text.substr(0, 1027));
    library.answers("getPortByWwn", with(fc_port(), "PortSymbolicName", "p\xC3\xB6rt \xFF"));
    EXPECT_EQ(walk(FCPORT, "Caption"), Lines{"p\xC3\xB6rt \xFF"});
}

TEST_F(PortHelper_Walk, WrongTypesLoseTheirPortAlone)
{
    library.answers("getFcPhyPortIndicesByAdapter", list_of({"1", "2"}));
    for (const char* name : {"wwn", "nodeWwn", "PortSymbolicName", "operatingSpeed", "supportedPortSpeeds",
                             "portTypeMOFValue", "maxFrameSize", "portStatusValue"}) {
        library.answers("getPortByWwn", [name](const Json::Value& request) {
            const Json::Value wrong = json("[{}]");
            return request["wwn"] == "1" ? with(fc_port(), name, wrong) : fc_port();
        });
        EXPECT_EQ(walk(FCPORT, "PortNumber"), Lines{"1"}) << name;
    }
    const Lines errors = log.said("ERR");
    ASSERT_EQ(errors.size(), 8u);
    EXPECT_EQ(errors[0], "ERR libGetPortByWwn got std exception: Type is not convertible to string");
    EXPECT_EQ(errors[7], "ERR libGetPortByWwn got std exception: Type is not convertible to int");
    library.answers("getPortByWwn", with(fc_port(), "maxFrameSize", Json::Value(3000000000u)));
    EXPECT_TRUE(walk(FCPORT).empty());
}

TEST_F(PortHelper_Walk, PortAddressesThatAreNone)
{
    library.answers("getFcPhyPortIndicesByAdapter", list_of({5, json("{}"), PORT}));
    EXPECT_EQ(walk(FCPORT, "PortNumber"), Lines{"2"});
    EXPECT_EQ(library.count("getPortByWwn"), 1u);
    EXPECT_EQ(log.said("ERR"), Lines(2, "ERR libGetFcPhyPortIndicesByAdapter got std exception: "
                                        "Type is not convertible to string"));
}

TEST_F(PortHelper_Walk, AnAdapterAddressThatIsNone)
{
    library.answers("getAllAdaptersIndexString", list_of({5, ADAPTER}));
    library.answers("getFcPhyPortIndicesByAdapter", [](const Json::Value& request) {
        return request["indexStr"] == ADAPTER ? list_of({PORT}) : json("{'error': 'no such adapter'}");
    });
    EXPECT_EQ(walk(FCPORT).size(), 1u);
    EXPECT_EQ(log.said("ERR"), (Lines{"ERR libGetAllAdaptersIndexString got std exception: "
                                      "Type is not convertible to string",
                                      "ERR libGetFcPhyPortIndicesByAdapter returns NULL."}));
}

TEST_F(PortHelper_Walk, NoAdapterList)
{
    for (const char* answer : {"null", "{'error': 1}", "{}", "[]", "{'indexStrings': {}}"}) {
        library.answers("getAllAdaptersIndexString", json(answer));
        EXPECT_TRUE(walk(FCPORT).empty()) << answer;
    }
    EXPECT_EQ(log.said(), Lines(5, "ERR libGetAllAdaptersIndexString returns NULL."));
    EXPECT_EQ(log.lines()[1].file, "PortHelper.cpp");
    log.clear();
    library.answers("getAllAdaptersIndexString", list_of({}));
    EXPECT_TRUE(walk(FCPORT).empty());
    EXPECT_EQ(log.said(), Lines{"WARN No adapters in the system. "});
}

TEST_F(PortHelper_Walk, FailuresOfTheCalls)
{
    library.throws("getFcPhyPortIndicesByAdapter", HbaAgentError{7, "busy"});
    EXPECT_TRUE(walk(FCPORT).empty());
    library.throws("getFcPhyPortIndicesByAdapter", std::runtime_error("broken"));
    EXPECT_TRUE(walk(FCPORT).empty());
    library.throws("getFcPhyPortIndicesByAdapter", 5);
    EXPECT_TRUE(walk(FCPORT).empty());
    library.answers("getFcPhyPortIndicesByAdapter", list_of({"1", "2"}));
    library.answers("getPortByWwn", [](const Json::Value& request) {
        if (request["wwn"] == "1")
            throw HbaAgentError{8, "no"};
        return fc_port();
    });
    EXPECT_EQ(walk(FCPORT).size(), 1u);
    EXPECT_EQ(log.said("ERR"), (Lines{"ERR libGetFcPhyPortIndicesByAdapter got User exception 7: busy",
                                      "ERR libGetFcPhyPortIndicesByAdapter got std exception: broken",
                                      "ERR libGetFcPhyPortIndicesByAdapter got default exception",
                                      "ERR libGetPortByWwn got User exception 8: no"}));
    library.throws("getAllAdaptersIndexString", HbaAgentError{9, "gone"});
    EXPECT_THROW(walk(FCPORT), HbaAgentError);
}

TEST_F(PortHelper_Walk, ById)
{
    const Json::Value adapters = list_of({"AA", "BB"});
    EXPECT_EQ(taken(helper->getInstancesByAdapterId(2, FCPORT, adapters), "DeviceID"),
              Lines{"10008c7cff000001"});
    EXPECT_EQ(library.told()[0], R"(getFcPhyPortIndicesByAdapter {"indexStr":"BB"})");
    EXPECT_EQ(library.count("getAllAdaptersIndexString"), 0u);
    for (const char* answer : {"null", "{'error': 1}", "{}", "[]", "{'indexStrings': 'x'}"}) {
        library.answers("getFcPhyPortIndicesByAdapter", json(answer));
        EXPECT_TRUE(helper->getInstancesByAdapterId(1, FCPORT, adapters).empty());
    }
    EXPECT_EQ(log.said("ERR"), Lines(5, "ERR libGetFcPhyPortIndicesByAdapter returns NULL."));
}

TEST_F(PortHelper_Walk, ByAddress)
{
    EXPECT_EQ(taken(helper->getFCPortInstancesByAdapter("20008c7cff000000"), "DeviceID"),
              Lines{"10008c7cff000001"});
    EXPECT_EQ(library.told()[0], R"(getFcPhyPortIndicesByAdapter {"indexStr":"20:00:8c:7c:ff:00:00:00"})");
    EXPECT_EQ(log.said(), (Lines{"DBG getFCPortInstancesByAdapter invoked with address= 20008c7cff000000",
                                 "DBG numOfPorts = 1"}));
    EXPECT_EQ(log.traces()[1], "DBG Entering: getInstancesByAdapterAddress");
    log.clear();
    library.calls.clear();
    // A list that comes with an error is not looked at.
    for (const char* answer :
         {"null", "{'error': 1, 'indexStrings': ['1']}", "{}", "[]", "{'indexStrings': 'x'}"}) {
        library.answers("getFcPhyPortIndicesByAdapter", json(answer));
        EXPECT_TRUE(helper->getInstancesByAdapterAddress("AABB", FCPORT).empty());
    }
    EXPECT_EQ(library.count("getPortByWwn"), 0u);
    EXPECT_EQ(log.said(),
              (Lines{"ERR libGetFcPhyPortIndicesByAdapter returns NULL",
                     "ERR libGetFcPhyPortIndicesByAdapter returns NULL", "ERR indexStrings is not member",
                     "ERR indexStrings is not member", "ERR indexString not Array"}));
}

TEST_F(PortHelper_Walk, ByAddressABadPortIsTold)
{
    library.answers("getFcPhyPortIndicesByAdapter", list_of({"1", "2"}));
    library.answers("getPortByWwn", [](const Json::Value& request) {
        return request["wwn"] == "1" ? json("{'error': 1}") : fc_port();
    });
    EXPECT_EQ(taken(helper->getInstancesByAdapterAddress("AABB", LOGICALPORTGROUP)).size(), 1u);
    EXPECT_EQ(log.said("ERR"), Lines{"ERR libGetPortByWwn response is null or has error"});
}

TEST_F(PortHelper_Walk, ByAnAddressThatIsNone)
{
    // An FC HBA without a storage driver has no address.
    EXPECT_TRUE(helper->getFCPortInstancesByAdapter("").empty());
    EXPECT_TRUE(library.calls.empty());
    EXPECT_EQ(log.said("ERR").size(), 1u);
}

TEST_F(PortHelper_Walk, AClassThatIsNotItsOwn)
{
    EXPECT_TRUE(walk(PORTCONTROLLER).empty());
    EXPECT_EQ(log.said(), (Lines{"DBG numOfPorts = 1", "INFO Unhandled class support"}));
}

TEST_F(PortHelper_Walk, NothingIsRemembered)
{
    EXPECT_EQ(walk(FCPORT).size(), 1u);
    EXPECT_EQ(walk(FCPORT).size(), 1u);
    EXPECT_EQ(library.count("getPortByWwn"), 2u);
    library.answers("getFcPhyPortIndicesByAdapter", json("{'indexStrings': null}"));
    EXPECT_EQ(walk(FCPORT).size(), 0u);
    EXPECT_EQ(log.said().back(), "DBG numOfPorts = 0");
}

#include "module/model/PhysicalAssetHelper.h"

#include "tests/module/model/Port_Fixture.h"

using namespace KPRV;

namespace {

struct Connectors : Port_Fixture
{
    const PhysicalAssetHelper* assets = PhysicalAssetHelper::getPhysicalAssetHelperObject();
    const Json::Value sfp = json("{'vendorName': ' ACME ', 'vendorPart': ' P-1 ', 'serialNo': ' S1 ',"
                                 " 'revision': ' A ', 'speed': ' 8G ', 'extendedID': ' SFP '}");

    Connectors()
    {
        const Json::Value adapter = json("{'hbaData': {}, 'driver': {}}");
        library.adapters({{"AA:01", adapter}, {"AA:02", adapter}, {"AA:03", adapter}});
        library.answers("getFcPhyPortIndicesByAdapter", list_of({"BB:01", "BB:02"}));
        library.answers("getOpticsSFP", sfp);
    }
    void one_port()
    {
        library.adapters({{"AA:01", json("{'hbaData': {}, 'driver': {}}")}});
        library.answers("getFcPhyPortIndicesByAdapter", list_of({"BB:01"}));
    }
    std::vector<Set_Properties> walk() { return taken(assets->getInstancesByClass(PHYSICALCONNECTOR)); }
    Lines tags() { return taken(assets->getInstancesByClass(PHYSICALCONNECTOR), "Tag"); }
};

} // namespace

TEST_F(Connectors, One)
{
    one_port();
    EXPECT_EQ(walk(), (std::vector<Set_Properties>{{
                          {"CreationClassName", "KALDERA_PhysicalConnector"},
                          {"Caption", "KALDERA_PhysicalConnector"},
                          {"ElementName", "KALDERA_PhysicalConnector"},
                          {"Tag", "S1_1_0"},
                          {"Manufacturer", "ACME"},
                          {"PartNumber", "P-1"},
                          {"SerialNumber", "S1"},
                          {"Model", " SFP "},
                          {"ConnectorDescription", " SFP "},
                          {"Version", "A"},
                          {"Description", " 8G "},
                          {"ConnectorType", "{118}"},
                          {"ConnectorGender", "0"},
                          {"ConnectorPinout", "0"},
                          {"NumPhysicalPins", "0"},
                          {"ConnectorLayout", "1"},
                      }}));
    EXPECT_EQ(library.told(),
              (Lines{"getAllAdaptersIndexString null", R"(getHbaByWwn {"wwn":"AA:01"})",
                     R"(getFcPhyPortIndicesByAdapter {"indexStr":"AA:01"})",
                     R"(getPortByWwn {"wwn":"BB:01"})", R"(getOpticsSFP {"indexStr":"BB:01"})"}));
    EXPECT_EQ(log.said(),
              (Lines{"INFO Number of Adapters: 1", "INFO The string AA:01 is already in : format",
                     "INFO The string AA:01 is already in : format", "INFO Number of Adapters: 1",
                     "INFO The string BB:01 is already in : format", "INFO getPortDetails success - BB:01",
                     "INFO The string BB:01 is already in : format"}));
}

TEST_F(Connectors, EqualSerialNumbersStayApartByPosition)
{
    EXPECT_EQ(tags(), (Lines{"S1_1_0", "S1_1_1", "S1_2_0", "S1_2_1", "S1_3_0", "S1_3_1"}));
}

TEST_F(Connectors, TheFirstFailingAdapterEndsTheWalk)
{
    library.answers("getHbaByWwn", [](const Json::Value& request) {
        return request["wwn"] == "AA:02" ? Json::Value() : json("{'hbaData': {}, 'driver': {}}");
    });
    EXPECT_EQ(tags(), (Lines{"S1_1_0", "S1_1_1"}));
    EXPECT_EQ(log.said().back(), "INFO Unable to get Adapter info 2 - AA:02");
    EXPECT_EQ(library.count("getHbaByWwn"), 2u);
}

TEST_F(Connectors, AnAdapterWithoutPortsDoesNotEndIt)
{
    library.answers("getFcPhyPortIndicesByAdapter", [](const Json::Value& request) {
        if (request["indexStr"] == "AA:01")
            return list_of({});
        return request["indexStr"] == "AA:02" ? Json::Value() : list_of({"BB:01"});
    });
    EXPECT_EQ(tags(), Lines{"S1_3_0"});
    EXPECT_EQ(log.said("WARN"), (Lines{"WARN There are no ports associated to Adapter id 1",
                                       "WARN There are no ports associated to Adapter id 2"}));
    EXPECT_EQ(log.said("ERR"), Lines{"ERR libGetFcPhyPortIndicesByAdapter returns NULL for AA:02"});
}

TEST_F(Connectors, AnEmptySlotHasNone)
{
    library.adapters({{"AA:01", json("{'hbaData': {}, 'driver': {}}")}});
    library.answers("getOpticsSFP", [this](const Json::Value& request) {
        return request["indexStr"] == "BB:01" ? json("{'error': 'empty'}") : sfp;
    });
    EXPECT_EQ(tags(), Lines{"S1_1_1"});
    EXPECT_EQ(log.said("ERR"), Lines{"ERR Unable to get SFP info for BB:01"});
    EXPECT_EQ(log.said("WARN"), Lines{"WARN getOpticsInfo failed for PortIndex =0 Ret = -1"});
}

TEST_F(Connectors, APortThatCannotBeReadHasNone)
{
    library.adapters({{"AA:01", json("{'hbaData': {}, 'driver': {}}")}});
    library.answers("getPortByWwn", [](const Json::Value& request) {
        return request["wwn"] == "BB:01" ? Json::Value() : fc_port();
    });
    EXPECT_EQ(tags(), Lines{"S1_1_1"});
    EXPECT_EQ(log.said("ERR"), Lines{"ERR Port Info is NOT available"});
    EXPECT_EQ(log.said("WARN"), Lines{});
}

TEST_F(Connectors, WithoutAdapters)
{
    library.answers("getAllAdaptersIndexString", list_of({}));
    EXPECT_TRUE(walk().empty());
    library.answers("getAllAdaptersIndexString", Json::Value());
    EXPECT_TRUE(walk().empty());
    EXPECT_EQ(log.said("WARN"), Lines(2, "WARN No adapters in the system. "));
}

TEST_F(Connectors, MissingMembersAreEmpty)
{
    one_port();
    for (const char* answer : {"{}", "[]", "5"}) {
        library.answers("getOpticsSFP", json(answer));
        Set_Properties set = walk().at(0);
        EXPECT_EQ(set["Tag"], "_1_0") << answer;
        EXPECT_EQ(set["Manufacturer"], "");
    }
}

TEST_F(Connectors, TextsAreCutToTheRecord)
{
    one_port();
    const std::string text(100, 'x');
    Json::Value answer;
    for (const char* name : {"vendorName", "vendorPart", "serialNo", "revision", "speed", "extendedID"})
        answer[name] = text;
    library.answers("getOpticsSFP", answer);
    Set_Properties set = walk().at(0);
    EXPECT_EQ(set["Manufacturer"], text.substr(0, 17));
    EXPECT_EQ(set["PartNumber"], text.substr(0, 17));
    EXPECT_EQ(set["SerialNumber"], text.substr(0, 17));
    EXPECT_EQ(set["Tag"], text.substr(0, 17) + "_1_0");
    EXPECT_EQ(set["Version"], text.substr(0, 5));
    EXPECT_EQ(set["Description"], text.substr(0, 31));
    EXPECT_EQ(set["Model"], text.substr(0, 7));
}

TEST_F(Connectors, WrongTypesLoseTheirPortAlone)
{
    library.adapters({{"AA:01", json("{'hbaData': {}, 'driver': {}}")}});
    for (const char* name : {"vendorName", "vendorPart", "serialNo", "revision", "speed", "extendedID"}) {
        library.answers("getOpticsSFP", [&](const Json::Value& request) {
            return request["indexStr"] == "BB:01" ? with(sfp, name, 5) : sfp;
        });
        EXPECT_EQ(tags(), Lines{"S1_1_1"}) << name;
    }
    EXPECT_EQ(log.said("ERR"), Lines(6, "ERR BB:01 - libGetOpticsSFP got std exception: "
                                        "Type is not convertible to string"));
    library.answers("getFcPhyPortIndicesByAdapter", list_of({5, "BB:02"}));
    EXPECT_EQ(tags(), Lines{"S1_1_1"});
}

TEST_F(Connectors, Exceptions)
{
    library.throws("getOpticsSFP", HbaAgentError{7, "busy"});
    EXPECT_TRUE(walk().empty());
    library.throws("getPortByWwn", HbaAgentError{7, "busy"});
    EXPECT_TRUE(walk().empty());
    // This one is not guarded; what was built before is freed.
    library.answers("getPortByWwn", fc_port());
    library.answers("getOpticsSFP", sfp);
    library.answers("getFcPhyPortIndicesByAdapter", [](const Json::Value& request) {
        if (request["indexStr"] == "AA:02")
            throw HbaAgentError{7, "busy"};
        return list_of({"BB:01"});
    });
    EXPECT_THROW(walk(), HbaAgentError);
}

TEST_F(Connectors, AClassThatIsNotItsOwn)
{
    one_port();
    EXPECT_TRUE(taken(assets->getInstancesByClass(FCPORT)).empty());
    EXPECT_EQ(log.said().back(), "INFO Default case . Other classes ");
}

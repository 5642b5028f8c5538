#include "tests/module/model/Adapter_Fixture.h"

using namespace KPRV;

using AdapterHelper_Failures = Adapter_Fixture;

TEST_F(AdapterHelper_Failures, NoList)
{
    for (const char* answer : {"null", "{'error': 1}", "{}", "[]", "{'indexStrings': {}}"}) {
        library.answers("getAllAdaptersIndexString", json(answer));
        EXPECT_TRUE(walk(PORTCONTROLLER).empty()) << answer;
    }
    EXPECT_EQ(log.said(), Lines(5, "ERR libGetAllAdaptersIndexString returns NULL."));
    EXPECT_EQ(log.lines()[0].file, "AdapterHelper.cpp");
}

TEST_F(AdapterHelper_Failures, AnEmptyList)
{
    library.adapters({});
    EXPECT_TRUE(walk(PORTCONTROLLER).empty());
    EXPECT_EQ(log.said(), (Lines{"INFO Number of Adapters: 0", "WARN No adapters in the system!"}));
}

TEST_F(AdapterHelper_Failures, AFailingAdapterIsLostAlone)
{
    library.adapters({{"AABB", Json::Value()}, {"CCDD", hba()}});
    library.answers("getHbaByWwn", [](const Json::Value& request) -> Json::Value {
        if (request["wwn"] == "AA:BB")
            throw HbaAgentError{7, "busy"};
        return hba();
    });
    EXPECT_EQ(walk(PORTCONTROLLER).size(), 1u);
    EXPECT_EQ(log.said(),
              (Lines{"INFO Number of Adapters: 2", "ERR AABB - libGetHbaByWwn got User exception 7: busy",
                     "INFO Unable to get Adapter info 1 - AABB", "INFO Adapter Type : FC HBA",
                     "INFO Number of instances: 1"}));
}

TEST_F(AdapterHelper_Failures, AnAdapterWithBadDetailsIsLostAlone)
{
    library.adapters({{"AABB", json("{'hbaData': {}}")}, {"CCDD", hba()}});
    library.answers("getHbaByWwn", [](const Json::Value& request) {
        return request["wwn"] == "AA:BB" ? json("{'hbaData': {}}") : hba();
    });
    EXPECT_EQ(walk(PRODUCT).size(), 1u);
    EXPECT_EQ(log.said("ERR"), Lines{"ERR Unable to get adapater details for AABB"});
    EXPECT_TRUE(log.has("INFO Unable to get Adapter info 1 - AABB"));
}

TEST_F(AdapterHelper_Failures, AnAdapterWithoutPortsIsInvisible)
{
    const Json::Value no_ports[] = {
        with(hba(), "hbaData", "portCount", 0), with(hba(), "hbaData", "portCount", Json::Value()),
        without(hba(), "hbaData", "portCount"), json("{'hbaData': null, 'driver': null}"),
        json("{'hbaData': [1], 'driver': 'x', 'firmware': 5}")};
    for (const Json::Value& answer : no_ports) {
        library.adapters({{WWN, answer}});
        for (const classId_t id : {PORTCONTROLLER, PHYSICALPACKAGE, PRODUCT, ADAPTERSOFTWAREIDENTITY})
            EXPECT_TRUE(walk(id).empty()) << compact(answer) << id;
    }
    EXPECT_EQ(log.said("WARN"),
              Lines(20, std::string("WARN There are no ports associated to Adapter id 1 - ") + WWN));
    EXPECT_EQ(library.count("getFlashInfo"), 0u);
}

TEST_F(AdapterHelper_Failures, WrongTypesLoseTheirAdapterAlone)
{
    const std::pair<const char*, const char*> members[] = {
        {"hbaData", "portCount"},
        {"hbaData", "hbaMAC"},
        {"hbaData", "wwn"},
        {"hbaData", "serialNumber"},
        {"hbaData", "oem"},
        {"hbaData", "partNum"},
        {"hbaData", "model"},
        {"driver", "networkDriverName"},
        {"driver", "storageDriverVersion"},
        {"firmware", "version"},
    };
    for (const auto& [object, name] : members) {
        library.adapters({{WWN, with(cna(), object, name, Json::arrayValue)}, {MAC, cna()}});
        EXPECT_EQ(walk(PHYSICALPACKAGE).size(), 1u) << name;
    }
    const Lines errors = log.said("ERR");
    ASSERT_EQ(errors.size(), 10u);
    EXPECT_EQ(errors[0], "ERR " + std::string(WWN) +
                             " - libGetHbaByWwn got std exception: Type is not convertible to int");
    EXPECT_EQ(errors[1], "ERR " + std::string(WWN) +
                             " - libGetHbaByWwn got std exception: Type is not convertible to string");
}

TEST_F(AdapterHelper_Failures, ABiosTextOfTheWrongTypeLosesWhatComesAfterIt)
{
    library.adapters({{WWN, with(hba(), "firmware", "biosVersion", 5)}, {MAC, cna()}});
    EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY, "InstanceID"),
              (Lines{"sdrv", "ndrv", "8c7cff000002_bios", "8c7cff000002_firmware"}));
    // No other class reads it.
    EXPECT_EQ(walk(PHYSICALPACKAGE).size(), 2u);
}

TEST_F(AdapterHelper_Failures, AddressesThatAreNone)
{
    library.adapters({{"", hba()}, {"A", hba()}, {WWN, hba()}});
    Json::Value list = json("{'indexStrings': ['', 'A', 5]}");
    list["indexStrings"].append(WWN);
    library.answers("getAllAdaptersIndexString", list);
    EXPECT_EQ(walk(PORTCONTROLLER).size(), 1u);
    EXPECT_EQ(library.count("getHbaByWwn"), 1u);
    EXPECT_TRUE(log.has("INFO Unable to get Adapter info 1 - "));
    EXPECT_TRUE(log.has("INFO Unable to get Adapter info 2 - A"));
    EXPECT_TRUE(log.has("INFO Unable to get Adapter info 3 - "));
}

TEST_F(AdapterHelper_Failures, ExceptionsOfTwoCallsPassAndLeaveNothingBehind)
{
    // What was built before is freed; a leak here is a report of the address sanitizer.
    library.adapters({{WWN, hba()}});
    library.throws("getFlashInfo", HbaAgentError{7, "busy"});
    EXPECT_THROW(walk(ADAPTERSOFTWAREIDENTITY), HbaAgentError);
    library.throws("getFlashInfo", std::runtime_error("broken"));
    EXPECT_THROW(walk(ADAPTERSOFTWAREIDENTITY), std::runtime_error);
    EXPECT_EQ(walk(PRODUCT).size(), 1u);
    library.throws("getAllAdaptersIndexString", 5);
    EXPECT_THROW(walk(PRODUCT), int);
}

TEST_F(AdapterHelper_Failures, WithoutALibrary)
{
    library.answers("getAllAdaptersIndexString", default_JsonReqFP(Json::Value()));
    for (const classId_t id : {PORTCONTROLLER, PHYSICALPACKAGE, PRODUCT, ADAPTERSOFTWAREIDENTITY})
        EXPECT_TRUE(walk(id).empty());
}

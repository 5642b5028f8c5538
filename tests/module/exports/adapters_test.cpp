#include "tests/module/exports/Golden.h"
#include "tests/module/exports/Module_Fixture.h"

#include <algorithm>

namespace KPRV {
namespace {

class Adapters : public Module_Fixture
{
protected:
    std::vector<std::string> all(const broker::Result& result, const char* property)
    {
        std::vector<std::string> values;
        for (const broker::Instance_Value& instance : result.instances)
            values.push_back(text_of(instance, property));
        return values;
    }
};

using Texts = std::vector<std::string>;

TEST_F(Adapters, OfTheDemoHostComeWholeAsTheClientSeesThem)
{
    open();
    const std::string server = This_Host::find().name;
    for (const char* name : {"KALDERA_PortController", "KALDERA_PhysicalPackage", "KALDERA_Product",
                             "KALDERA_AdapterSoftwareIdentity"})
        expect_golden(std::string("demo_") + name, golden_text(enumerate(name), server));
}

TEST_F(Adapters, ControllersAndCardsCostOneExchangeAnAdapterAndOneForTheList)
{
    open();
    for (const char* name : {"KALDERA_PortController", "KALDERA_PhysicalPackage", "KALDERA_Product"}) {
        mark();
        enumerate(name);
        EXPECT_EQ((Texts{"getAllAdaptersIndexString", "getHbaByWwn", "getHbaByWwn", "getHbaByWwn"}),
                  simulator.call_names())
            << name;
        // A converged adapter goes by its MAC.
        const auto requests = simulator.requests("getHbaByWwn");
        EXPECT_EQ("20:00:02:4b:4c:10:00:00", requests[0]["wwn"].asString());
        EXPECT_EQ("02:4b:4c:20:00:00", requests[1]["mac"].asString());
        EXPECT_EQ(1u, requests[1].size());
        EXPECT_TRUE(simulator.requests("getAllAdaptersIndexString")[0].isNull());
    }
}

TEST_F(Adapters, SoftwareIdentitiesAskEachFlashOnceMore)
{
    open();
    mark();
    enumerate("KALDERA_AdapterSoftwareIdentity");
    EXPECT_EQ((Texts{"getAllAdaptersIndexString", "getHbaByWwn", "getFlashInfo", "getHbaByWwn",
                     "getFlashInfo", "getHbaByWwn", "getFlashInfo"}),
              simulator.call_names());
    EXPECT_EQ("02:4b:4c:20:00:00", simulator.requests("getFlashInfo")[1]["indexStr"].asString());
}

TEST_F(Adapters, SharedDriversAreListedOnceAndInFrontOfWhatIsOfOneCard)
{
    open("twins.json");
    EXPECT_EQ((Texts{"kldrfc", "2000024b4c110000_bios", "2000024b4c110000_firmware", "2000024b4c120000_bios",
                     "2000024b4c120000_firmware"}),
              all(enumerate("KALDERA_AdapterSoftwareIdentity"), "InstanceID"));
}

TEST_F(Adapters, OneThatFailsIsLostAloneAndWithAReason)
{
    open("twins.json");
    for (const char* fault :
         {R"("do": "null")", R"("do": "error")", R"("do": "remove", "member": "hbaData")",
          R"("do": "remove", "member": "driver")", R"("do": "throw", "code": 7, "message": "busy")",
          R"("do": "throw", "type": "std::runtime_error", "message": "lost")",
          R"("do": "throw", "type": "int")"}) {
        SCOPED_TRACE(fault);
        simulator.clear_faults();
        simulator.add_fault(std::string(R"({"call": "getHbaByWwn", "address": "20:00:02:4b:4c:11:00:00", )") +
                            fault + "}");
        mark();
        EXPECT_EQ(Texts{"2000024b4c120000"}, all(enumerate("KALDERA_PortController"), "DeviceID"));
        EXPECT_FALSE(said("ERR").empty());
        const Lines walk = said_by("AdapterHelper.cpp");
        EXPECT_EQ(1, std::count(walk.begin(), walk.end(),
                                "INFO Unable to get Adapter info 1 - 20:00:02:4b:4c:11:00:00"))
            << ::testing::PrintToString(walk);
    }
}

TEST_F(Adapters, WithoutPortsAreInvisible)
{
    open("portless.json");
    EXPECT_EQ(Texts{"2000024b4c130000"}, all(enumerate("KALDERA_PortController"), "DeviceID"));
    EXPECT_EQ(Lines{"WARN There are no ports associated to Adapter id 2 - 20:00:02:4b:4c:14:00:00"},
              said("WARN"));
}

TEST_F(Adapters, DisabledThroughTheLibraryAreSeenSoByTheNextEnumeration)
{
    open("one_hba.json");
    const auto status = [&] {
        const broker::Result result = enumerate("KALDERA_PortController");
        return broker::plain_text(*result.instances.at(0).property("OperationalStatus")) + " " +
               broker::plain_text(*result.instances[0].property("EnabledState"));
    };
    EXPECT_EQ("{11} 2", status());
    Json::Value request;
    request["indexStr"] = "20:00:02:4b:4c:10:00:00";
    request["enableState"] = false;
    simulator.symbol<Json::Value(const Json::Value&)>("setAdapterState")(request);
    EXPECT_EQ("{10} 3", status());
}

TEST_F(Adapters, AreFoundByTheirKeys)
{
    open();
    const broker::Result names = server->enumerate_instance_names("KALDERA_PhysicalPackage");
    ASSERT_EQ(3u, names.paths.size());
    for (const broker::Path_Value& path : names.paths) {
        const broker::Result found = server->get_instance(path);
        ASSERT_EQ(CMPI_RC_OK, found.rc);
        ASSERT_EQ(1u, found.instances.size());
        EXPECT_EQ(path.key("Tag")->as_text(), text_of(found.instances[0], "Tag"));
    }
    broker::Path_Value unknown = names.paths[0];
    broker::set_value(unknown.keys, "Tag", broker::Plain_Value::text("no such card"));
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, server->get_instance(unknown).rc);
}

TEST_F(Adapters, KeepToThePropertiesThatTheClientAsksFor)
{
    open("one_hba.json");
    const broker::Result result =
        server->enumerate_instances("KALDERA_Product", std::vector<std::string>{"Version", "NoSuchProperty"});
    ASSERT_EQ(1u, result.instances.size());
    EXPECT_EQ("3.2.1.0", text_of(result.instances[0], "Version"));
    EXPECT_EQ("(absent)", text_of(result.instances[0], "Description"));
}

TEST_F(Adapters, AnswerAlikeUnderTheHabitsOfBothServers)
{
    for (const broker::Server_Options& options :
         {broker::Server_Options::sfcb_like(), broker::Server_Options::pegasus_like()}) {
        open("demo.json", options);
        const broker::Result names = server->enumerate_instance_names("KALDERA_PortController");
        EXPECT_EQ(3u, names.paths.size());
        EXPECT_TRUE(server->get_instance(names.paths.at(2)).ok());
        EXPECT_EQ(3u, server->enumerate_instances("KALDERA_PortController").instances.size());
        close();
    }
}

TEST_F(Adapters, LogTheRoadOfAnEnumeration)
{
    open("one_hba.json");
    mark();
    enumerate("KALDERA_Product");
    EXPECT_EQ(
        (Lines{"DBG Entering: enum_instances", "DBG Returning instances", "DBG Returning: enum_instances"}),
        said_by("KALDERA_Product_Provider.cpp"));
    Lines manager = said_by("FCHBAManager.cpp");
    std::erase(manager, "DBG Inside FCHBAManager Constructor");
    EXPECT_EQ((Lines{"DBG Entering: getInstances", "INFO Requested classId : 7",
                     "INFO Requested class is: KALDERA_Product", "DBG Returning: getInstances"}),
              manager);
}

} // namespace
} // namespace KPRV

#include "tests/module/exports/Update_Fixture.h"

namespace KPRV {
namespace {

using Update = Update_Fixture;

const char* const GOOD_IMAGE = "firmware-version=3.2.2.0\n";

TEST_F(Update, IsOfferedByOneServiceWithItsCapabilities)
{
    const broker::Result services = enumerate("KALDERA_HBASoftwareInstallationService");
    ASSERT_EQ(1u, services.instances.size());
    EXPECT_EQ("Kaldera Adapter Software Update Service", text_of(services.instances[0], "Name"));
    const broker::Result capabilities = enumerate("KALDERA_HBASoftwareInstallationServiceCapabilities");
    ASSERT_EQ(1u, capabilities.instances.size());
    EXPECT_EQ("Kaldera Adapter Software Update Service", text_of(capabilities.instances[0], "InstanceID"));
    const auto codes = [&](const char* property) {
        std::vector<uint64> result;
        for (const broker::Plain_Value& each : capabilities.instances[0].property(property)->elements())
            result.push_back(each.as_uint());
        return result;
    };
    EXPECT_EQ((std::vector<uint64>{4, 5}), codes("SupportedInstallOptions"));
    EXPECT_EQ((std::vector<uint64>{3, 8}), codes("SupportedURISchemes"));
    EXPECT_EQ((std::vector<uint64>{5}), codes("SupportedSynchronousActions"));
}

TEST_F(Update, OfAFileIsSeenAtTheAdapter)
{
    folder.write("fw.bin", GOOD_IMAGE);
    const Lines calls = calls_of_an_update();
    for (const std::string& file : {folder.path("fw.bin"), std::string("fw.bin")}) {
        EXPECT_EQ(0u, install("file://" + file));
        EXPECT_EQ(calls, simulator.call_names());
        EXPECT_EQ(request(file), simulator.requests("adapterUpdateFlash").at(0));
        Lines expected = {"DBG Entering: InstallFromURI", "INFO file=" + file};
        const Lines helper = of_helper(file, "DBG status=0 message = Flash update successful");
        expected.insert(expected.end(), helper.begin(), helper.end());
        for (const char* line :
             {"DBG Software update is success", "DBG return value = 0", "DBG Returning: InstallFromURI"})
            expected.push_back(line);
        EXPECT_EQ(expected, told_of_update());
    }
    EXPECT_EQ("3.2.2.0", firmware());
    EXPECT_TRUE(std::filesystem::exists(folder.path("fw.bin")));
}

TEST_F(Update, WantsAUriThenATargetThenOptions)
{
    folder.write("fw.bin", GOOD_IMAGE);
    const std::vector<broker::Named_Value> nothing;
    expect_refusal(nothing, {"ERR URI.value is empty"}, "empty input parameters");
    expect_refusal(arguments("", options({5})), {"ERR URI.value is empty"}, "empty input parameters");
    expect_refusal({{"URI", broker::Plain_Value::text("no uri")}}, {"ERR Target is empty"},
                   "empty input parameters");
    auto without_options = arguments("no uri", options({5}));
    without_options.pop_back();
    expect_refusal(without_options, {"ERR InstallOptions.value.size() is  0"}, "empty input parameters");
    expect_refusal(arguments("no uri", options({})), {"ERR InstallOptions.value.size() is  0"},
                   "empty input parameters");
    // Options come before the URI is looked into.
    expect_refusal(arguments("no uri", options({3})),
                   {"ERR InstallOptions[0] validation failed. throw invalide option type"},
                   "invalid option type");
    expect_refusal(arguments("no uri", options({5})), {"ERR malformed uri. Throw error"}, "malformed URI");
}

TEST_F(Update, LooksAtTheFirstOptionOnly)
{
    folder.write("fw.bin", GOOD_IMAGE);
    for (const auto& list : {options({4}), options({5}), options({4, 3}), options({5, 0, 65535})})
        EXPECT_EQ(0u, call(arguments("file://fw.bin", list)));
    for (const auto& list : {options({3, 4}), options({0}), options({6, 5}), options({65535})})
        expect_refusal(arguments("file://fw.bin", list),
                       {"ERR InstallOptions[0] validation failed. throw invalide option type"},
                       "invalid option type");
}

TEST_F(Update, DoesNotReadTheValuesOfOptions)
{
    folder.write("fw.bin", GOOD_IMAGE);
    auto in = arguments("file://fw.bin", options({5}));
    in.push_back(
        {"InstallOptionsValues", broker::Plain_Value::array(CMPI_string, {broker::Plain_Value::text("x")})});
    EXPECT_EQ(0u, call(in));
}

TEST_F(Update, KnowsTwoSchemesInSmallLetters)
{
    folder.write("fw.bin", GOOD_IMAGE);
    for (const char* uri : {"FILE://fw.bin", "File://fw.bin", "TFTP://host/fw.bin", "http://host/fw.bin",
                            "fw.bin", "file:/fw.bin"})
        expect_refusal(arguments(uri, options({5})), {"ERR malformed uri. Throw error"}, "malformed URI");
    expect_refusal(arguments("file://", options({5})), {"INFO file="}, "malformed file URI");
}

TEST_F(Update, OfAMissingFileAsksNoLibrary)
{
    expect_refusal(arguments("file:///nowhere/fw.bin", options({5})),
                   {"INFO file=/nowhere/fw.bin", "ERR File doesnt exist"}, "File not exists");
}

TEST_F(Update, WantsAControllerThatIsThere)
{
    folder.write("fw.bin", GOOD_IMAGE);
    const Lines calls = calls_of_a_search();
    const broker::Path_Value good = target;
    const auto expect_no_target = [&] {
        expect_failure(arguments("file://fw.bin", options({5})),
                       {"INFO file=fw.bin", "ERR Couldnt find the matching port controller."},
                       "Could not find target controller");
        EXPECT_EQ(calls, simulator.call_names());
    };
    set_value(target.keys, "DeviceID", broker::Plain_Value::text("2000024b4c999999"));
    expect_no_target();
    // The library's form of the address is not the key's.
    set_value(target.keys, "DeviceID", broker::Plain_Value::text(INDEX));
    expect_no_target();
    target = good;
    set_value(target.keys, "SystemName", broker::Plain_Value::text("elsewhere"));
    expect_no_target();
    target = server->enumerate_instance_names("KALDERA_ComputerSystem").paths.at(0);
    expect_no_target();
}

// Keys decide, whatever class the client's path names.
TEST_F(Update, FindsTheControllerUnderAnotherClassToo)
{
    folder.write("fw.bin", GOOD_IMAGE);
    target.class_name = "CIM_PortController";
    EXPECT_EQ(0u, install("file://fw.bin"));
    target.class_name = "CIM_LogicalDevice";
    EXPECT_EQ(0u, install("file://fw.bin"));
}

TEST_F(Update, ThatTheLibraryRefusesIsAFailure)
{
    folder.write("empty.bin", "");
    Lines said = {"INFO file=empty.bin"};
    for (const std::string& line : of_helper("empty.bin", "DBG status=2 message = empty.bin is empty"))
        said.push_back(line);
    said.push_back("ERR UpdatePortControllerSoftware method failed");
    expect_failure(arguments("file://empty.bin", options({5})), said, "controller update failed");
    EXPECT_EQ("3.2.1.0", firmware());
}

TEST_F(Update, WithoutAGoodAnswerIsAFailure)
{
    folder.write("fw.bin", GOOD_IMAGE);
    const Lines calls = calls_of_an_update();
    for (const char* fault :
         {R"("do": "null")", R"("do": "error")", R"("do": "remove", "member": "status")",
          R"("do": "remove", "member": "message")", R"("do": "answer", "answer": [0])",
          R"("do": "answer", "answer": 0)", R"("do": "answer", "answer": {"status": 0})"}) {
        SCOPED_TRACE(fault);
        simulator.add_fault(std::string(R"({"call": "adapterUpdateFlash", )") + fault + "}");
        Lines said = {"INFO file=fw.bin"};
        for (const std::string& line : of_helper("fw.bin", "ERR libAdapterUpdateFlash is failed."))
            said.push_back(line);
        said.push_back("ERR UpdatePortControllerSoftware method failed");
        expect_failure(arguments("file://fw.bin", options({5})), said, "controller update failed");
        EXPECT_EQ(calls, simulator.call_names());
        simulator.clear_faults();
    }
}

// What the library throws, or answers with members of the wrong type, ends in the same place.
TEST_F(Update, ThatThrowsIsAFailureWithoutAReason)
{
    folder.write("fw.bin", GOOD_IMAGE);
    for (const char* fault :
         {R"("do": "throw", "code": 7, "message": "busy")",
          R"("do": "throw", "type": "std::runtime_error", "message": "lost")",
          R"("do": "throw", "type": "int")", R"("do": "set", "member": "status", "value": "good")",
          R"("do": "set", "member": "status", "value": -1)",
          R"("do": "set", "member": "message", "value": 1)"}) {
        SCOPED_TRACE(fault);
        simulator.add_fault(std::string(R"({"call": "adapterUpdateFlash", )") + fault + "}");
        Lines said = {"INFO file=fw.bin"};
        Lines helper = of_helper("fw.bin", "");
        std::erase(helper, "");
        said.insert(said.end(), helper.begin(), helper.end());
        expect_failure(arguments("file://fw.bin", options({5})), said, "unknown Exception");
        simulator.clear_faults();
    }
    simulator.add_fault(R"({"call": "getAllAdaptersIndexString", "do": "throw", "type": "int"})");
    expect_failure(arguments("file://fw.bin", options({5})), {"INFO file=fw.bin"}, "unknown Exception");
}

TEST_F(Update, WithAStatusOtherThan0IsAFailure)
{
    folder.write("fw.bin", GOOD_IMAGE);
    for (const char* status : {"1", "7", "4294967295"}) {
        simulator.add_fault(R"({"call": "adapterUpdateFlash", "do": "answer",
                                "answer": {"message": "m", "status": )" +
                            std::string(status) + "}}");
        EXPECT_EQ(2u, install("file://fw.bin"));
        EXPECT_EQ(Lines{"ERR UpdatePortControllerSoftware method failed"}, said("ERR"));
        simulator.clear_faults();
    }
}

TEST_F(Update, WithoutAdaptersFindsNoTarget)
{
    folder.write("fw.bin", GOOD_IMAGE);
    simulator.load_file(inventory("empty.json"));
    EXPECT_EQ(2u, install("file://fw.bin"));
    const Lines errors = said("ERR");
    EXPECT_EQ("ERR Couldnt find the matching port controller.", errors.back());
}

} // namespace
} // namespace KPRV

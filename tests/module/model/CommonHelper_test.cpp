#include "module/model/CommonHelper.h"

#include "tests/module/model/Taken_Instances.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Fixed_Host.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

using namespace KPRV;

namespace {

struct Host_System : testing::Test
{
    const CommonHelper* helper = CommonHelper::getCommonHelperObject();
    Fixed_Host host;
    Fake_Library library;
    Log_Capture log;

    Set_Properties system() { return taken(helper->getComputerSystemInstances(COMPUTERSYSTEM)).at(0); }
};

} // namespace

TEST_F(Host_System, IsOneInstanceWithoutTheLibrary)
{
    const char* text = "The host with Kaldera's adapters installed.";
    const auto systems = taken(helper->getComputerSystemInstances(COMPUTERSYSTEM));
    EXPECT_EQ(systems, (std::vector<Set_Properties>{{
                           {"CreationClassName", "KALDERA_ComputerSystem"},
                           {"Name", "10.0.0.1"},
                           {"NameFormat", "IP"},
                           {"OtherIdentifyingInfo", "{10.0.0.1}"},
                           {"IdentifyingDescriptions", "{Ipv4 Address}"},
                           {"ElementName", text},
                           {"Description", text},
                           {"Caption", text},
                           {"Dedicated", "{0, 14}"},
                           {"OperationalStatus", "{2}"},
                           {"StatusDescriptions", "{The System is in service}"},
                       }}));
    EXPECT_TRUE(library.calls.empty());
    EXPECT_EQ(log.said(), Lines{});
    EXPECT_EQ(log.traces()[0], "DBG Entering: getComputerSystemInstances");
}

TEST_F(Host_System, WhoseNameDoesNotResolve)
{
    host_calls.gethostbyname_r = find_no_host;
    Set_Properties set = system();
    EXPECT_EQ(set["Name"], "h");
    EXPECT_EQ(set["NameFormat"], "Other");
    EXPECT_EQ(set["IdentifyingDescriptions"], "{Fully Qualified Domain Name}");
    EXPECT_EQ(log.said("WARN"), Lines{});
}

TEST_F(Host_System, WithoutAddressOrName)
{
    host_calls.gethostname = [](char*, size_t) { return -1; };
    Set_Properties set = system();
    EXPECT_EQ(set["Name"], "localhost");
    EXPECT_EQ(set["NameFormat"], "Other");
    EXPECT_EQ(log.said("WARN"), Lines{"WARN No host IP / Name  retrived in the function, So function fills "
                                      "localhost for host info."});
}

TEST_F(Host_System, ResultsOfTheLookUp)
{
    struct Row
    {
        int result;
        const char* format;
        const char* description;
        Lines warning;
    };
    const char* domain = "{Fully Qualified Domain Name}";
    const Row rows[] = {
        {0, "IP", "{Ipv4 Address}", {}},
        {1, nullptr, "{}", {"WARN IPV6 functionality is yet to be implemented"}},
        {2, "Other", domain, {}},
        {3,
         "Other",
         domain,
         {"WARN No host IP / Name  retrived in the function, So function fills localhost for host info."}},
        {4, "Other", domain, {}},
        {5, nullptr, "{}", {"WARN Entered Default case "}},
        {-1, nullptr, "{}", {"WARN Entered Default case "}},
    };
    for (const Row& row : rows) {
        log.clear();
        Set_Properties set = taken(helper->getComputerSystemInstance(COMPUTERSYSTEM, row.result, "x"));
        EXPECT_EQ(set.contains("NameFormat"), row.format != nullptr) << row.result;
        EXPECT_EQ(set["NameFormat"], row.format ? row.format : "") << row.result;
        EXPECT_EQ(set["IdentifyingDescriptions"], row.description) << row.result;
        EXPECT_EQ(set["OtherIdentifyingInfo"], "{x}");
        EXPECT_EQ(log.said("WARN"), row.warning) << row.result;
    }
}

TEST_F(Host_System, BearsTheClassThatWasAskedFor)
{
    const auto systems = taken(helper->getComputerSystemInstances(FCPORT));
    EXPECT_EQ(systems.at(0).at("CreationClassName"), "KALDERA_FCPort");
}

// The verb that follows profiles, as users run it on the small host.
#include "tests/kldrcim/Run_Kldrcim.h"

#include <gtest/gtest.h>
#include <json/json.h>

namespace KPRV::kldrcim {
namespace {

// What conforms to another is no root; a circle is entered once; a subprofile stands under its profile, one
// without a profile under the standard; the software of a subprofile shows where it is another.
TEST(Cli_Profiles, Tree)
{
    Outcome run = on_fabric("profiles");
    EXPECT_EQ(0, run.status);
    EXPECT_EQ(no_library, run.error);
    EXPECT_EQ(R"(profile Standard 1.0, SNIA, 4 profiles conform
├─ profile Profile P 2.0, DMTF, 1 profiles conform
│  ├─ profile Round 1 profiles conform
│  │  └─ profile Profile P 2.0, DMTF
│  ├─ TOY_Service manager
│  ├─ subprofile Sub 3.0
│  ├─ subprofile Other
│  │  └─ software Software\n2
│  └─ software Software 1 3.2.3.0, KLDR
├─ subprofile Orphan
└─ software Software 1 3.2.3.0, KLDR
profile Alone organization 7
)",
              run.out);
}

TEST(Cli_Profiles, Ascii)
{
    const std::string begins = "profile Standard 1.0, SNIA, 4 profiles conform\n"
                               "|- profile Profile P 2.0, DMTF, 1 profiles conform\n"
                               "|  |- profile Round 1 profiles conform\n"
                               "|  |  `- profile Profile P 2.0, DMTF\n";
    EXPECT_EQ(0u, on_fabric("profiles --ascii").out.find(begins));
    EXPECT_EQ(0u, on_fabric("profiles", "LC_ALL=C").out.find(begins));
}

TEST(Cli_Profiles, Json)
{
    Outcome run = on_fabric("profiles --format json");
    EXPECT_EQ(0, run.status);
    Json::Value roots;
    ASSERT_TRUE(Json::Reader().parse(run.out, roots)) << run.out;
    ASSERT_EQ(2u, roots.size());
    const Json::Value& standard = roots[0];
    EXPECT_EQ("profile", standard["kind"].asString());
    EXPECT_EQ("Standard", standard["name"].asString());
    EXPECT_EQ("root/kaldera:KALDERA_RegisteredProfile.InstanceID=\"std\"", standard["path"].asString());
    EXPECT_EQ("4 profiles conform", standard["facts"][2].asString());
    const Json::Value& profile = standard["children"][0];
    const Json::Value& element = profile["children"][1];
    EXPECT_EQ("element", element["kind"].asString());
    EXPECT_EQ("TOY_Service", element["what"].asString());
    EXPECT_EQ("manager", element["name"].asString());
    EXPECT_FALSE(element.isMember("children"));
    // For programs all of it is there, the software of a subprofile too.
    const Json::Value& subprofile = profile["children"][2];
    EXPECT_EQ("subprofile", subprofile["kind"].asString());
    EXPECT_EQ("Software 1", subprofile["children"][0]["name"].asString());
    EXPECT_EQ("Alone", roots[1]["name"].asString());
}

TEST(Cli_Profiles, Usage)
{
    Outcome run = on_fabric("profiles more");
    EXPECT_EQ(2, run.status);
    EXPECT_EQ("kldrcim: usage: kldrcim [options] profiles\n", run.error);
    run = on_fabric("profiles --format mof");
    EXPECT_EQ(2, run.status);
    EXPECT_EQ("kldrcim: --format mof makes no sense for profiles\n", run.error);
}

TEST(Cli_Profiles, WithoutTheClass)
{
    Outcome run = kldrcim("profiles");
    EXPECT_EQ(1, run.status);
    EXPECT_EQ("", run.out);
    EXPECT_EQ("kldrcim: CIM_ERR_INVALID_CLASS (5): no answer from KALDERA_RegisteredProfile\n", run.error);
}

} // namespace
} // namespace KPRV::kldrcim

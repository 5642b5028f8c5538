// What needs no agent: usage, the list, and a module without one. With an agent:
// tests/module/exports/rpc_test.cpp
#include "tests/kldrcim/Run_Kldrcim.h"

#include "kldrcim/walks/Rpc_Methods.h"

#include <gtest/gtest.h>
#include <json/json.h>

#include <algorithm>

namespace KPRV::kldrcim {
namespace {

TEST(Cli_Rpc, TheListTellsEachMethodWithItsParameters)
{
    const Outcome run = kldrcim("rpc --list");
    EXPECT_EQ(0, run.status);
    EXPECT_EQ("", run.error);
    EXPECT_EQ(2 + static_cast<std::ptrdiff_t>(rpc_methods().size()),
              std::count(run.out.begin(), run.out.end(), '\n'));
    for (const Rpc_Method& method : rpc_methods())
        EXPECT_NE(std::string::npos,
                  run.out.find("\n" + method.name + (method.parameters.empty() ? "\n" : " ")))
            << method.name;
}

TEST(Cli_Rpc, APatternChooses)
{
    EXPECT_EQ("Method                    Parameters\n"
              "------------------------  -------------\n"
              "configuration.setAlias    alias:object\n"
              "configuration.setAliases  aliases:array\n",
              kldrcim("rpc --list '*ALIAS*'").out);
    EXPECT_EQ("Method  Parameters\n------  ----------\n", kldrcim("rpc --list nothing").out);
}

TEST(Cli_Rpc, TheListInJson)
{
    Json::Value list;
    ASSERT_TRUE(Json::Reader().parse(kldrcim("--format json rpc --list '*createVnic'").out, list));
    ASSERT_EQ(1u, list.size());
    EXPECT_EQ("configuration.createVnic", list[0]["method"].asString());
    ASSERT_EQ(3u, list[0]["parameters"].size());
    EXPECT_EQ("minBandwidth", list[0]["parameters"][1]["name"].asString());
    EXPECT_EQ("integer", list[0]["parameters"][1]["type"].asString());
}

TEST(Cli_Rpc, UsageErrors)
{
    const std::pair<const char*, const char*> wrong[] = {
        {"rpc", "usage: kldrcim [options] rpc METHOD [PARAMETER...]"},
        {"rpc --list a b", "usage: kldrcim [options] rpc --list [PATTERN]"},
        {"rpc --raw a b", "usage: kldrcim [options] rpc --raw TEXT|-"},
        {"rpc --raw", "--raw wants a value"},
        {"rpc --list --raw a", "--list and --raw make no sense together"},
        {"rpc --format mof a", "--format mof makes no sense for rpc"},
        {"classes --list", "--list makes no sense for classes; it is for rpc"},
        {"rpc a '['", "not JSON: ["},
        {"rpc +", "no method beside a \"+\""},
        {"rpc a +", "no method beside a \"+\""},
        {"rpc a + + b", "no method beside a \"+\""},
        {"rpc a + b '{'", "not JSON: {"},
    };
    for (auto [arguments, error] : wrong) {
        const Outcome run = kldrcim(arguments);
        EXPECT_EQ(2, run.status) << arguments;
        EXPECT_EQ("kldrcim: " + std::string(error) + "\n", run.error) << arguments;
        EXPECT_EQ("", run.out) << arguments;
    }
}

TEST(Cli_Rpc, AModuleWithoutAnAgentAnswersAStatus)
{
    for (const char* arguments : {"rpc discovery.getHost", "rpc --raw '{}'"}) {
        const Outcome run = kldrcim(arguments);
        EXPECT_EQ(1, run.status);
        EXPECT_EQ("kldrcim: CIM_ERR_INVALID_CLASS (5)\n", run.error);
        EXPECT_EQ("", run.out);
    }
}

} // namespace
} // namespace KPRV::kldrcim

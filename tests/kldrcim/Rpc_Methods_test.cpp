#include "kldrcim/walks/Rpc_Methods.h"

#include <gtest/gtest.h>

#include <map>
#include <set>

namespace KPRV::kldrcim {
namespace {

std::string parameters(const std::string& name)
{
    const Rpc_Method* method = find_rpc_method(name);
    std::string text = method ? "" : "unknown";
    for (const Rpc_Parameter& parameter : method ? method->parameters : std::vector<Rpc_Parameter>())
        text += parameter.name + ":" + rpc_type_name(parameter.type) + " ";
    return text;
}

TEST(Rpc_Methods, EachNameComesOnceInItsFamily)
{
    std::set<std::string> names;
    std::map<std::string, int> families;
    for (const Rpc_Method& method : rpc_methods()) {
        EXPECT_TRUE(names.insert(method.name).second) << method.name;
        ++families[method.name.substr(0, method.name.find('.'))];
    }
    EXPECT_EQ((std::map<std::string, int>{{"configuration", 46}, {"diagnostics", 20}, {"discovery", 53}}),
              families);
}

TEST(Rpc_Methods, ParametersComeByPosition)
{
    EXPECT_EQ("", parameters("discovery.getHost"));
    EXPECT_EQ("wwn:string ", parameters("discovery.getHbaByWwn"));
    EXPECT_EQ("mac:string minBandwidth:integer maxBandwidth:integer ",
              parameters("configuration.createVnic"));
    EXPECT_EQ("indexStr:string port:object propArray:array ", parameters("configuration.setPortByWwn"));
    EXPECT_EQ("requestID:string stopOnError:boolean ", parameters("diagnostics.startTests"));
}

TEST(Rpc_Methods, ConstantsTakeNoPositionAndWhatIsNotReadDoes)
{
    EXPECT_EQ("pPortWwn:string lPortWwn:string ", parameters("discovery.getDynamicVportStatistics"));
    EXPECT_EQ("requestID:string hbaWwn:string portWwn:string mode:integer speed:integer numCycles:integer "
              "frameCount:string dataPattern:string ",
              parameters("diagnostics.doLoopbackTest"));
}

TEST(Rpc_Methods, NamesAreComparedWithCaseAndHandlersAreNone)
{
    EXPECT_EQ(nullptr, find_rpc_method("discovery.gethost"));
    EXPECT_EQ(nullptr, find_rpc_method("discovery.getFcoeByPort"));
    EXPECT_EQ(nullptr, find_rpc_method(""));
}

} // namespace
} // namespace KPRV::kldrcim

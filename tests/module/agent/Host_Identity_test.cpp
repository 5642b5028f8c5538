#include "module/agent/ProviderDiscoveryMethods.h"
#include "module/schema/CIM_ComputerSystem.h"
#include "tests/module/agent/Agent_Fixture.h"
#include "tests/module/runtime/dispatch/Recording_Context.h"

namespace KPRV {
namespace {

class Host_Identity : public Agent_Fixture
{
protected:
    static constexpr const char* METHOD = "discovery.getHost";
    static constexpr const char* HYPERVISOR = "VMWARE_ESXComputerSystem";

    /// Found in the order of the calls.
    void system(const char* class_name, const std::vector<const char*>& info)
    {
        const Ref<CIM_ComputerSystem> found(create<CIM_ComputerSystem>(true));
        found->CreationClassName.set(class_name);
        found->OtherIdentifyingInfo.null = 0;
        for (const char* text : info)
            found->OtherIdentifyingInfo.value.append(text);
        ref(found.ptr());
        // The context gives its last one first.
        context.results.insert(context.results.begin(), Ref<Instance>(found.ptr()));
    }
    void no_name_space() { context.next_rep = nullptr; }
    static Lines found()
    {
        Lines result;
        const Array<String> info = ProviderDiscoveryMethods::getOtherIdentifyingInfo();
        for (uint32 i = 0; i < info.size(); i++)
            result.push_back(info[i].c_str());
        return result;
    }

    Notes notes;
    Recording_Context context{notes};
    const Pushed pushed{&context};
};

TEST_F(Host_Identity, IsAskedOfTheHypervisorsOwnNameSpace)
{
    system("CIM_ComputerSystem", {"a", "b", "c"});
    system(HYPERVISOR, {"tag", "Maker", "Model 5", "more"});
    system(HYPERVISOR, {"x", "y", "z"});
    const Log_Capture log;
    EXPECT_EQ((Lines{"Maker", "Model 5"}), found());
    EXPECT_EQ((Notes_List{"enum vmware/esxv2", "destroy"}), notes.list());
    EXPECT_EQ(
        (Lines{"DBG ComputerSystem Instance in vmware/esx2 ", "DBG Creation class name - CIM_ComputerSystem",
               "DBG Creation class name - VMWARE_ESXComputerSystem"}),
        log.said());
    EXPECT_EQ((Lines{"DBG Entering: getOtherIdentifyingInfo", "DBG Returning: getOtherIdentifyingInfo"}),
              log.traces());
}

TEST_F(Host_Identity, IsEmptyWhereNothingMatches)
{
    EXPECT_EQ(Lines{}, found());
    system("VMware_ESXComputerSystem", {"a", "b", "c"});
    system("VMWARE_ESXComputerSystem2", {"a", "b", "c"});
    system("", {"a", "b", "c"});
    EXPECT_EQ(Lines{}, found());
}

TEST_F(Host_Identity, IsEmptyWhereTheServerRefuses)
{
    no_name_space();
    const Log_Capture log;
    EXPECT_EQ(Lines{}, found());
    EXPECT_EQ(Notes_List{"enum vmware/esxv2"}, notes.list());
    EXPECT_EQ(Lines{}, log.said());
}

TEST_F(Host_Identity, OfTooFewTextsIsNone)
{
    system(HYPERVISOR, {"a", "b"});
    EXPECT_EQ(Lines{}, found());
    context.results.clear();
    system(HYPERVISOR, {});
    EXPECT_EQ(Lines{}, found());
}

TEST_F(Host_Identity, IsNotAskedWhereTheLibraryKnowsIt)
{
    const char* const answer = R"({"result":{"hostManufacturer":"M","hostModel":"5"}})";
    library.answers("getHost", json(answer));
    EXPECT_EQ(answer, result(METHOD, "['any', 'params']"));
    EXPECT_EQ(Lines{R"(getHost ["any","params"])"}, library.told());
    EXPECT_EQ(Notes_List{}, notes.list());
}

TEST_F(Host_Identity, IsNotAskedWhereTheInnerAnswerIsAFailure)
{
    // One level down the failure is not lifted.
    for (const char* answer : {R"({"result":{"error":{"code":1}}})", R"({"result":{"error":null}})"}) {
        library.answers("getHost", json(answer));
        EXPECT_EQ(answer, result(METHOD, "[]"));
    }
    EXPECT_EQ(Notes_List{}, notes.list());
}

TEST_F(Host_Identity, CompletesTheAnswerBesideTheInnerObject)
{
    for (const char* inner :
         {R"({"hostManufacturer":"M","hostModel":""})", R"({"hostManufacturer":"","hostModel":"5"})",
          R"({"hostManufacturer":"M"})", R"({"hostModel":"5"})", R"({"hostManufacturer":7,"hostModel":"5"})",
          "{}", "null", "[]", R"("text")"}) {
        context.results.clear();
        system(HYPERVISOR, {"tag", "Maker", "Model 5"});
        library.answers("getHost", json(std::string("{'result': ") + inner + "}"));
        EXPECT_EQ(std::string(R"({"hostManufacturer":"Maker","hostModel":"Model 5","result":)") + inner + "}",
                  result(METHOD, "[]"));
    }
}

TEST_F(Host_Identity, LeavesTheAnswerAsItIsWhereNothingIsFound)
{
    for (const char* answer : {R"({"result":{"hostManufacturer":"M","hostModel":""}})", R"({"result":{}})",
                               "{}", "null", "[1]", "5"}) {
        library.answers("getHost", json(answer));
        EXPECT_EQ(answer, result(METHOD, "[]"));
    }
    no_name_space();
    library.answers("getHost", json("{'result': {}}"));
    EXPECT_EQ(R"({"result":{}})", result(METHOD, "[]"));
}

TEST_F(Host_Identity, CompletesAnAnswerThatIsNull)
{
    system(HYPERVISOR, {"tag", "Maker", "Model 5"});
    EXPECT_EQ(R"({"hostManufacturer":"Maker","hostModel":"Model 5"})", result(METHOD, "[]"));
}

TEST_F(Host_Identity, CannotCompleteWhatIsNoObject)
{
    system(HYPERVISOR, {"tag", "Maker", "Model 5"});
    library.answers("getHost", json("[1]"));
    EXPECT_TRUE(error(METHOD, "[]").starts_with("JSONRPCError 200 in Json::Value")) << error(METHOD, "[]");
}

TEST_F(Host_Identity, GivesWayToAFailureOfTheLibrary)
{
    system(HYPERVISOR, {"tag", "Maker", "Model 5"});
    library.answers("getHost", json("{'error': {'code': 9}}"));
    EXPECT_EQ(R"({"error":{"code":9},"version":"1.1"})", result(METHOD, "[]"));
    library.throws("getHost", HbaAgentError{4, "off"});
    EXPECT_EQ("USERDEFINEDError 4 off", error(METHOD, "[]"));
    library.throws("getHost", 5);
    EXPECT_EQ("UnCaughtError 5000 Unknown error that was not caught", error(METHOD, "[]"));
}

} // namespace
} // namespace KPRV

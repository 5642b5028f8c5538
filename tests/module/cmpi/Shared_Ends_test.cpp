#include "module/cmpi/Shared_Ends.h"
#include "tests/module/cmpi/Test_Server.h"

#include <algorithm>

using namespace KPRV;
using broker::Result;

namespace {

struct Shared_Ends_Test : testing::Test
{
    Shared_Ends_Test()
    {
        provider.factory('I');
        provider.factory('A');
        script.enum_instances = [this](const Instance*, const Script::Deliver& deliver) {
            const Ref<Instance> x(make_named<Sample_Element>("x"));
            const auto link = [&](const Ref<Instance>& end, const char* port) {
                deliver(make_link(Ref<Instance>(end).steal(), make_port(port)));
            };
            for (const char* port : {"1", "2", "3"})
                link(a, port);
            link(x, "4");
            link(a, "5");
            if (on_end)
                on_end();
            return 0;
        };
        server.core->calls.record(true);
    }
    ~Shared_Ends_Test() override
    {
        provider.cleanup('I');
        provider.cleanup('A');
        EXPECT_EQ(1, a->__refs) << "an end is still held";
    }

    Result enumerate(bool names)
    {
        CMPIInstanceMI* const mi = &provider.data().instance_mi;
        return provider.operate(class_path("Sample_Link"), [&](auto context, auto result, auto cop) {
            return names ? mi->ft->enumerateInstanceNames(mi, context, result, cop)
                         : mi->ft->enumerateInstances(mi, context, result, cop, nullptr);
        });
    }
    Result refer(bool names)
    {
        CMPIAssociationMI* const mi = &provider.data().association_mi;
        return provider.operate(path_of("Sample_Element", "a"), [&](auto context, auto result, auto cop) {
            return names ? mi->ft->referenceNames(mi, context, result, cop, nullptr, nullptr)
                         : mi->ft->references(mi, context, result, cop, nullptr, nullptr, nullptr);
        });
    }

    /// How many paths were made of elements and of ports.
    std::pair<long, long> ends_made()
    {
        const Texts calls = server.calls();
        return {std::ranges::count(calls, "CMNewObjectPath Sample_Element"),
                std::ranges::count(calls, "CMNewObjectPath Sample_Port")};
    }

    static std::string link_of(const broker::Path_Value& path)
    {
        return text_of_key(*path.key("Antecedent")->as_path(), "Name") +
               text_of_key(*path.key("Dependent")->as_path(), "Name");
    }
    static Texts links_of(const Result& result)
    {
        Texts links;
        for (const broker::Path_Value& path : result.paths)
            links.push_back(link_of(path));
        for (const broker::Instance_Value& instance : result.instances) {
            links.push_back(link_of(instance.path));
            for (const char* role : {"Antecedent", "Dependent"}) {
                const broker::Plain_Value* const end = instance.property(role);
                EXPECT_TRUE(end && end->as_path() && *end == *instance.path.key(role)) << role;
            }
        }
        return links;
    }

    /// The same of instances and of names.
    void expect_made(Result (Shared_Ends_Test::*operation)(bool names), const Texts& links,
                     std::pair<long, long> ends)
    {
        for (const bool names : {false, true}) {
            EXPECT_EQ(links, links_of((this->*operation)(names))) << names;
            EXPECT_EQ(ends, ends_made()) << names;
        }
    }

    Test_Server server;
    Served_Provider provider{server, link_registration};
    const Ref<Instance> a{make_named<Sample_Element>("a")};
    std::function<void()> on_end;
    const Texts all = {"a1", "a2", "a3", "x4", "a5"}, of_a = {"a1", "a2", "a3", "a5"};
};

} // namespace

TEST_F(Shared_Ends_Test, AnEndBecomesAPathOnceForAllInARowThatHaveIt)
{
    expect_made(&Shared_Ends_Test::enumerate, all, {3, 5});
}

TEST_F(Shared_Ends_Test, ReferencesShareToo)
{
    // The fourth link is not delivered, so that all that is has one end.
    expect_made(&Shared_Ends_Test::refer, of_a, {1, 4});
}

TEST_F(Shared_Ends_Test, NothingIsSharedBetweenRequests)
{
    enumerate(false);
    server.calls();
    enumerate(false);
    EXPECT_EQ((std::pair<long, long>{3, 5}), ends_made());
}

TEST_F(Shared_Ends_Test, APathThatTheServerRefusesIsNotShared)
{
    // The first path is the link's own, the second its first end.
    server.core->calls.fail("CMNewObjectPath", 2, CMPI_RC_ERR_FAILED);
    const Result result = enumerate(true);
    ASSERT_EQ(5u, result.paths.size());
    EXPECT_EQ(nullptr, result.paths[0].key("Antecedent"));
    EXPECT_EQ("a2", link_of(result.paths[1]));
    EXPECT_EQ("a5", link_of(result.paths[4]));
}

TEST_F(Shared_Ends_Test, AnExceptionOfTheProviderLeavesNoEndBehind)
{
    on_end = [] { throw std::runtime_error("after the last"); };
    EXPECT_EQ("after the last", enumerate(false).exception.value_or(""));
    server.core->violations.clear();
}

TEST(Shared_Ends, KnowTheLastEndOfEachOfThreeRoles)
{
    const char* const roles[] = {"Initiator", "Target", "LogicalUnit", "Fourth"};
    const Ref<Instance> a(make_named<Sample_Element>("a")), b(make_named<Sample_Element>("b"));
    CMPIObjectPath paths[5] = {};
    Shared_Ends ends;
    EXPECT_EQ(nullptr, ends.find(roles[0], a.ptr()));
    for (int i = 0; i < 4; i++)
        ends.note(roles[i], a.ptr(), &paths[i]);
    for (int i = 0; i < 3; i++)
        EXPECT_EQ(&paths[i], ends.find(roles[i], a.ptr())) << roles[i];
    EXPECT_EQ(nullptr, ends.find(roles[3], a.ptr()));
    EXPECT_EQ(nullptr, ends.find(roles[0], b.ptr()));
    ends.note(roles[1], b.ptr(), &paths[4]);
    EXPECT_EQ(nullptr, ends.find(roles[1], a.ptr()));
    EXPECT_EQ(&paths[4], ends.find(roles[1], b.ptr()));
    EXPECT_EQ(&paths[0], ends.find(roles[0], a.ptr()));
}

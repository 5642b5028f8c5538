#include "module/runtime/dispatch/cimom.h"
#include "tests/module/cmpi/Test_Server.h"

using namespace KPRV;

TEST(Cleanup_Operations, AVetoHoldsAgainstAServerThatGoesOn)
{
    Test_Server server;
    script.load = [] {
        cimom::allow_unload(false);
        return 0;
    };
    Served_Provider provider(server, element_registration);
    provider.factory('I');
    provider.factory('M');
    EXPECT_FALSE(provider.adapter()->unload_allowed);

    EXPECT_EQ(provider.cleanup('I', false), CMPI_RC_DO_NOT_UNLOAD);
    EXPECT_EQ(provider.cleanup('M', false), CMPI_RC_DO_NOT_UNLOAD);
    EXPECT_EQ(provider.adapter()->load_count, 2u);

    EXPECT_EQ(provider.cleanup('I', true), CMPI_RC_OK);
    EXPECT_EQ(provider.adapter()->load_count, 1u);
    EXPECT_EQ(provider.cleanup('M', true), CMPI_RC_OK);
    EXPECT_EQ(provider.adapter(), nullptr);
    EXPECT_EQ(script.calls, (Texts{"construct", "load", "unload", "destroy"}));
}

TEST(Cleanup_Operations, AVetoCanBeTakenBack)
{
    Test_Server server;
    script.load = [] {
        cimom::allow_unload(false);
        cimom::allow_unload(true);
        return 0;
    };
    Served_Provider provider(server, element_registration);
    provider.factory('I');
    EXPECT_EQ(provider.cleanup('I', false), CMPI_RC_OK);
    EXPECT_EQ(provider.adapter(), nullptr);
}

TEST(Cleanup_Operations, UnloadHasAContextButNotThroughTheAssociationTable)
{
    for (const char kind : {'I', 'M', 'N', 'A'}) {
        Test_Server server;
        Thread_Context* context = nullptr;
        script.unload = [&] {
            context = Thread_Context::top();
            return 0;
        };
        Served_Provider provider(server, element_registration);
        provider.factory(kind);
        provider.cleanup(kind);
        EXPECT_EQ(context != nullptr, kind != 'A') << kind;
        EXPECT_EQ(Thread_Context::top(), nullptr);
        EXPECT_EQ(script.calls, (Texts{"construct", "load", "unload", "destroy"}));
    }
}

TEST(Cleanup_Operations, AnExceptionOfUnloadPassesAndLeavesNoContext)
{
    Test_Server server;
    script.unload = []() -> int { throw std::runtime_error("unload"); };
    Served_Provider provider(server, element_registration);
    provider.factory('I');
    EXPECT_THROW(provider.cleanup('I'), std::runtime_error);
    EXPECT_EQ(Thread_Context::top(), nullptr);
    ASSERT_NE(provider.adapter(), nullptr);

    script.unload = nullptr;
    EXPECT_EQ(provider.cleanup('I'), CMPI_RC_OK);
    EXPECT_EQ(provider.adapter(), nullptr);
}

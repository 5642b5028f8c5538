#include "module/cmpi/cimple_cmpi_adapter.h"
#include "tests/module/cmpi/Test_Server.h"

using namespace KPRV;

TEST(cimple_cmpi_adapter, FactoriesOfAllKindsShareOneAdapter)
{
    Test_Server server;
    Served_Provider provider(server, element_registration);
    EXPECT_EQ(provider.adapter(), nullptr);

    EXPECT_EQ(provider.factory('I'), &provider.data().instance_mi);
    CMPI_Adapter* const adapter = provider.adapter();
    ASSERT_NE(adapter, nullptr);
    EXPECT_EQ(adapter->load_count, 1u);
    EXPECT_EQ(provider.factory('M'), &provider.data().method_mi);
    EXPECT_EQ(provider.factory('A'), &provider.data().association_mi);
    EXPECT_EQ(provider.adapter(), adapter);
    EXPECT_EQ(adapter->load_count, 3u);
    EXPECT_EQ(script.calls, (Texts{"construct", "load"}));

    for (const char kind : {'I', 'M', 'A'})
        EXPECT_EQ(provider.cleanup(kind), CMPI_RC_OK);
    EXPECT_EQ(script.calls, (Texts{"construct", "load", "unload", "destroy"}));
    EXPECT_EQ(provider.adapter(), nullptr);
}

TEST(cimple_cmpi_adapter, AnMiIsJoinedWhenItIsAskedFor)
{
    Test_Server server;
    Served_Provider provider(server, element_registration);
    const CMPI_Static_Data& data = provider.data();
    provider.factory('N');
    EXPECT_EQ(data.indication_mi.hdl, &data);
    EXPECT_EQ(data.indication_mi.ft, &data.indication_ft);
    EXPECT_EQ(data.instance_mi.hdl, nullptr);
    EXPECT_EQ(data.instance_mi.ft, nullptr);
    EXPECT_EQ(data.method_mi.ft, nullptr);
    EXPECT_EQ(data.association_mi.ft, nullptr);

    provider.factory('I');
    provider.factory('M');
    provider.factory('A');
    EXPECT_EQ(data.instance_mi.ft, &data.instance_ft);
    EXPECT_EQ(data.method_mi.ft, &data.method_ft);
    EXPECT_EQ(data.association_mi.ft, &data.association_ft);
    EXPECT_EQ(_adapter(&data.association_mi), provider.adapter());
    for (const char kind : {'I', 'M', 'A', 'N'})
        provider.cleanup(kind);
}

TEST(cimple_cmpi_adapter, AnUnknownKindCountsButGetsNoMi)
{
    Test_Server server;
    Served_Provider provider(server, element_registration);
    EXPECT_EQ(provider.factory('X'), nullptr);
    ASSERT_NE(provider.adapter(), nullptr);
    EXPECT_EQ(provider.factory('i'), nullptr);
    EXPECT_EQ(provider.adapter()->load_count, 2u);
    provider.factory('I');
    for (int i = 0; i < 3; i++)
        provider.cleanup('I');
    EXPECT_EQ(provider.adapter(), nullptr);
}

TEST(cimple_cmpi_adapter, AProviderComesBackInTheSameBlock)
{
    Test_Server server;
    Served_Provider provider(server, element_registration);
    for (int round = 0; round < 2; round++) {
        provider.factory('I');
        EXPECT_EQ(provider.data().magic, 0x5DE2B131u);
        EXPECT_EQ(provider.cleanup('I'), CMPI_RC_OK);
        EXPECT_EQ(provider.data().magic, 0xDDDDDDDDu);
        EXPECT_EQ(provider.adapter(), nullptr);
    }
    EXPECT_EQ(script.calls,
              (Texts{"construct", "load", "unload", "destroy", "construct", "load", "unload", "destroy"}));
}

TEST(cimple_cmpi_adapter, AFailingLoadIsIgnored)
{
    Test_Server server;
    script.load = [] { return 99; };
    script.unload = [] { return 99; };
    Served_Provider provider(server, element_registration);
    EXPECT_NE(provider.factory('I'), nullptr);
    EXPECT_EQ(provider.adapter()->model_meta_class, &Sample_Element::static_meta_class);
    EXPECT_EQ(provider.cleanup('I'), CMPI_RC_OK);
}

TEST(cimple_cmpi_adapter, TheBrokerOfTheFirstCallStays)
{
    Test_Server server;
    Served_Provider provider(server, element_registration);
    provider.factory('I');
    void* mi = nullptr;
    const CMPIBroker other = {};
    cimple_cmpi_adapter('C', &provider.data(), element_registration, &other, nullptr, "Sample_Provider", 'I',
                        &mi);
    EXPECT_EQ(provider.adapter()->broker, server.broker.cmpi());
    EXPECT_EQ(provider.adapter()->load_count, 2u);
    provider.cleanup('I');
    provider.cleanup('I');
}

TEST(cimple_cmpi_adapter, LoadRunsWithAContextAndTheConstructorWithout)
{
    Test_Server server;
    Thread_Context* at_construction = nullptr;
    Thread_Context* at_load = nullptr;
    script.construct = [&] {
        at_construction = Thread_Context::top();
        return 0;
    };
    script.load = [&] {
        at_load = Thread_Context::top();
        return 0;
    };
    Served_Provider provider(server, element_registration);
    provider.factory('I');
    EXPECT_EQ(at_construction, nullptr);
    EXPECT_NE(at_load, nullptr);
    EXPECT_EQ(Thread_Context::top(), nullptr);
    provider.cleanup('I');
}

TEST(cimple_cmpi_adapter, AnExceptionOfLoadLeavesTheBlockEmpty)
{
    Test_Server server;
    script.load = []() -> int { throw std::runtime_error("load"); };
    Served_Provider provider(server, element_registration);
    EXPECT_THROW(provider.factory('I'), std::runtime_error);
    EXPECT_EQ(provider.adapter(), nullptr);
    EXPECT_EQ(Thread_Context::top(), nullptr);
    EXPECT_EQ(script.calls, (Texts{"construct", "load", "destroy"}));

    script.load = nullptr;
    EXPECT_NE(provider.factory('I'), nullptr);
    EXPECT_EQ(provider.data().magic, 0x5DE2B131u);
    EXPECT_EQ(provider.adapter()->load_count, 1u);
    provider.cleanup('I');
}

TEST(cimple_cmpi_adapter, AnExceptionOfTheConstructorLeavesNothing)
{
    Test_Server server;
    script.construct = []() -> int { throw std::runtime_error("construct"); };
    Served_Provider provider(server, element_registration);
    EXPECT_THROW(provider.factory('I'), std::runtime_error);
    EXPECT_EQ(provider.adapter(), nullptr);
    EXPECT_EQ(provider.data().magic, 0u);
}

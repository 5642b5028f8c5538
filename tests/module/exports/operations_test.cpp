#include "module/runtime/dispatch/Registration.h"
#include "tests/module/exports/Module_Fixture.h"
#include "tests/support/Small_Stack.h"

#include <algorithm>
#include <set>
#include <thread>

#include <pthread.h>

namespace KPRV {
namespace {

class Module_Operations : public Module_Fixture
{
protected:
    static broker::Path_Value path_of(const char* class_name) { return {{}, "root/kaldera", class_name, {}}; }
};

TEST_F(Module_Operations, AnswerUnsupportedForEveryMethodWithoutABody)
{
    const std::set<std::string> with_body = {
        "KALDERA_AgentService.executeMethod",
        "KALDERA_AlarmDevice.SetAlarmState",
        "KALDERA_EthLoopbackDiagnosticTest.RunDiagnostic",
        "KALDERA_HBASoftwareInstallationService.InstallFromURI",
        "KALDERA_LoopbackDiagnosticTest.RunDiagnostic",
        "KALDERA_MemoryDiagnosticTest.RunDiagnostic",
        "KALDERA_PCILoopbackDiagnosticTest.RunDiagnostic",
    };
    open("empty.json");
    size_t methods = 0;
    for (const Registration* each = server->module().registrations(); each; each = each->next) {
        if (each->meta_class->flags & (FLAG_ASSOCIATION | FLAG_INDICATION))
            continue;
        for (uint32 i = 0; i < each->meta_class->num_meta_features; i++) {
            const Meta_Feature* feature = each->meta_class->meta_features[i];
            if (!(feature->flags & FLAG_METHOD))
                continue;
            const std::string name = std::string(each->meta_class->name) + "." + feature->name;
            if (with_body.contains(name))
                continue;
            SCOPED_TRACE(name);
            const broker::Result result =
                server->invoke_method(path_of(each->meta_class->name), feature->name, {});
            EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, result.rc);
            methods++;
        }
    }
    EXPECT_GT(methods, 100u);
}

TEST_F(Module_Operations, KnowMethodsWhateverTheirCase)
{
    open("empty.json");
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED,
              server->invoke_method(path_of("KALDERA_FCPortStatistics"), "RESETSELECTEDSTATS", {}).rc);
    EXPECT_EQ(CMPI_RC_ERR_METHOD_NOT_FOUND,
              server->invoke_method(path_of("KALDERA_FCPortStatistics"), "NoSuchMethod", {}).rc);
}

TEST_F(Module_Operations, DoNotKnowClassesBeyondTheRepository)
{
    open("empty.json");
    // The provider is asked for a class that it has never heard of.
    broker::Request request;
    request.operation = broker::Operation::GET_INSTANCE;
    request.path = path_of("ACME_Unheard");
    EXPECT_EQ(CMPI_RC_ERR_FAILED, server->run_at("KALDERA_Product", request).rc);
}

TEST_F(Module_Operations, OfDifferentProvidersRunSideBySide)
{
    open("one_hba.json");
    simulator.add_fault(R"({"call": "getHbaByWwn", "do": "hold"})");
    mark();
    std::vector<std::thread> clients;
    for (const char* name : {"KALDERA_PortController", "KALDERA_Product"})
        clients.emplace_back(
            [this, name] { EXPECT_EQ(1u, server->enumerate_instances(name).instances.size()); });
    // Both are inside the library at the same time.
    EXPECT_TRUE(simulator.wait_for_calls("getHbaByWwn", 2));
    simulator.release();
    for (std::thread& client : clients)
        client.join();
}

TEST_F(Module_Operations, OfOneProviderTakeTurns)
{
    open("one_hba.json");
    simulator.add_fault(R"({"call": "getHbaByWwn", "at": 1, "do": "hold"})");
    mark();
    std::vector<std::thread> clients;
    for (int i = 0; i < 2; i++)
        clients.emplace_back(
            [this] { EXPECT_EQ(1u, server->enumerate_instances("KALDERA_Product").instances.size()); });
    EXPECT_TRUE(simulator.wait_for_calls("getHbaByWwn", 1));
    EXPECT_FALSE(simulator.wait_for_calls("getHbaByWwn", 2, 200)) << "the second must wait for the first";
    simulator.release();
    for (std::thread& client : clients)
        client.join();
    EXPECT_EQ(2u, simulator.requests("getHbaByWwn").size());
}

TEST_F(Module_Operations, ManyAtOnceAnswerEachAlike)
{
    open();
    std::vector<std::thread> clients;
    for (int i = 0; i < 8; i++) {
        clients.emplace_back([this, i] {
            const char* names[] = {"KALDERA_PortController", "KALDERA_Product", "KALDERA_PhysicalPackage",
                                   "KALDERA_AdapterSoftwareIdentity"};
            const size_t counts[] = {3, 3, 3, 7};
            for (int n = 0; n < 10; n++)
                EXPECT_EQ(counts[i % 4], server->enumerate_instances(names[i % 4]).instances.size());
        });
    }
    for (std::thread& client : clients)
        client.join();
}

TEST_F(Module_Operations, RunOnTheSmallStacksOfARequestThread)
{
    open();
    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    // One server gives its request threads no more.
    pthread_attr_setstacksize(&attributes, 256 * 1024);
    pthread_t thread;
    const auto client = [](void* self) -> void* {
        broker::Local_Server* server = static_cast<broker::Local_Server*>(self);
        EXPECT_EQ(3u, server->enumerate_instances("KALDERA_PortController").instances.size());
        return nullptr;
    };
    ASSERT_EQ(0, pthread_create(&thread, &attributes, client, server.get()));
    pthread_join(thread, nullptr);
    pthread_attr_destroy(&attributes);
}

TEST_F(Module_Operations, ComeAndGoWithTheCountOfTheirInterfaces)
{
    open("one_hba.json");
    EXPECT_TRUE(server->enumerate_instances("KALDERA_Product").ok());
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, server->get_instance(path_of("KALDERA_Product")).rc);
    EXPECT_EQ(CMPI_RC_OK, server->unload(false));
    EXPECT_EQ(0u, server->providers().count());
    EXPECT_EQ(1u, server->enumerate_instances("KALDERA_Product").instances.size());
}

// A server's request threads may have small stacks, and its clients name what they like.
TEST_F(Module_Operations, TakeNoReferenceApartThatFitsNowhere)
{
    open("empty.json");
    broker::Path_Value nested = path_of("KALDERA_FCPortSystemDevice");
    for (int depth = 0; depth < 400; depth++) {
        broker::Path_Value around = path_of("KALDERA_FCPortSystemDevice");
        around.keys.push_back({"GroupComponent", broker::Plain_Value::path(std::move(nested))});
        nested = std::move(around);
    }
    const broker::Path_Value service = {{},
                                        "root/kaldera",
                                        "KALDERA_HBASoftwareInstallationService",
                                        {{"Name", broker::Plain_Value::path(nested)}}};
    on_small_stack([&] {
        mark();
        server->get_instance(nested);
        server->invoke_method(service, "InstallFromURI", {{"Target", broker::Plain_Value::path(nested)}});
        server->associators("KALDERA_FCPortSystemDevice", nested, {});
    });
    const Lines warnings = said("WARN");
    EXPECT_NE(0,
              std::ranges::count(warnings, "WARN failed to assign instance of KALDERA_FCPortSystemDevice to "
                                           "KALDERA_FCPortSystemDevice.GroupComponent"));
    EXPECT_NE(0, std::ranges::count(warnings, "WARN type mismatch on Name: instance/string"));
    EXPECT_EQ("", server->violations().text());
}

} // namespace
} // namespace KPRV

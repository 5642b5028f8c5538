// Events of the adapter library on their way through the built module to the subscribers of a server.
#include "broker/Subscription.h"
#include "broker/values/Path_Parser.h"
#include "tests/module/exports/Alert_Fixture.h"
#include "tests/module/exports/Golden.h"
#include "tests/module/exports/Traces.h"
#include "tests/support/Eventually.h"

#include <atomic>
#include <dlfcn.h>
#include <thread>

namespace KPRV {
namespace {

class Alert_Indications : public Alert_Fixture
{
protected:
    void SetUp() override
    {
        Alert_Fixture::SetUp();
        open();
#ifdef __SANITIZE_ADDRESS__
        // Alerts stay allocated; the leak checker can tell them only while the module is mapped.
        static void* const pinned = dlopen(KLDR_MODULE, RTLD_NOW);
        ASSERT_TRUE(pinned);
        drop_what_tests_left();
#endif
        take_alerts();
    }
    /// A module that stays mapped keeps what is in its queue.
    void drop_what_tests_left()
    {
        // What comes behind all of it tells when it is gone.
        std::atomic<bool> is_empty = false;
        server->set_sink([&](const std::string&, const broker::Instance_Value& alert) {
            is_empty = is_empty || text_of(alert, "EventID") == "ZNT_LAST";
            return CMPI_RC_OK;
        });
        broker::Subscription subscription(*server, CLASS);
        ASSERT_EQ(CMPI_RC_OK, subscription.add("root/kaldera"));
        ASSERT_TRUE(simulator.event(event(9, 1, R"(, "eventIdValue": "ZNT_LAST")")));
        EXPECT_TRUE(eventually([&] { return is_empty.load(); }));
        ASSERT_EQ(CMPI_RC_OK, subscription.remove("root/kaldera"));
        simulator.clear_calls();
    }
    std::vector<std::string> subscription_calls()
    {
        std::vector<std::string> names = simulator.call_names();
        std::erase_if(names, [](const std::string& name) { return name.find("vent") == std::string::npos; });
        return names;
    }
};

TEST_F(Alert_Indications, ReachASubscriberAsStandardAndProprietaryAlert)
{
    broker::Subscription subscription(*server, CLASS);
    mark();
    ASSERT_EQ(CMPI_RC_OK, subscription.add("root/kaldera"));
    EXPECT_EQ((Texts{"register_for_events", "registerEventProcessingCb"}), subscription_calls());
    EXPECT_TRUE(simulator.requests("register_for_events").at(0)["dropOldEvents"].asBool());
    ASSERT_TRUE(
        simulator.event(event(2, 11, R"(, "eventMsg": "Link lost", "eventIdValue": "ZNT_PORT_DISCONNECT")")));
    ASSERT_TRUE(wait_for(2));
    EXPECT_EQ((Texts{"root/kaldera KLDR131083", "root/kaldera PROPKLDR131083"}), came());
    const std::vector<broker::Instance_Value> both = alerts();
    for (const broker::Instance_Value& alert : both) {
        EXPECT_EQ(CLASS, alert.path.class_name);
        EXPECT_EQ("Link lost", text_of(alert, "Message"));
        EXPECT_EQ("ZNT_PORT_DISCONNECT", text_of(alert, "EventID"));
        EXPECT_EQ("Base port lost connection with fabric.", text_of(alert, "Description"));
        EXPECT_EQ("Check switch and HBA configuration. Also, check SFP and cable connection.",
                  alert.property("RecommendedActions")->elements().at(0).as_text());
        EXPECT_EQ(PORT, alert.property("MessageArguments")->elements().at(0).as_text());
    }
    EXPECT_EQ(6u, both[0].property("PerceivedSeverity")->as_uint());
    EXPECT_EQ(5u, both[1].property("PerceivedSeverity")->as_uint());
    EXPECT_EQ(both[0].property("SequenceNumber")->as_sint() + 1,
              both[1].property("SequenceNumber")->as_sint());
}

// A module that stays mapped writes on in the log of the first test.
#ifndef __SANITIZE_ADDRESS__
TEST_F(Alert_Indications, TraceWhatTheyEnter)
{
    mark();
    {
        broker::Subscription subscription(*server, CLASS);
        ASSERT_EQ(CMPI_RC_OK, subscription.add("root/kaldera"));
        // One event of each category, since each has a path of its own.
        for (int category = 1; category <= 20; category++)
            simulator.event(event(category, 1));
        simulator.event(event(9, 2, R"(, "eventMsg": "the last")"));
        EXPECT_TRUE(eventually([&] {
            const std::vector<broker::Instance_Value> all = alerts();
            return !all.empty() && text_of(all.back(), "Message") == "the last";
        }));
    }
    expect_golden("traces_of_alerts", as_sorted_text(traces_of(log_lines())), ".txt");
}
#endif

TEST_F(Alert_Indications, NameAnInstanceThatAClientCanGet)
{
    broker::Subscription subscription(*server, CLASS);
    subscription.add("root/kaldera");
    simulator.event(event(2, 1));
    ASSERT_TRUE(wait_for(1));
    const std::string path = text_of(alerts()[0], "AlertingManagedElement");
    const broker::Result ports = enumerate("KALDERA_FCPort");
    const auto is_named = [&](const broker::Instance_Value& port) {
        return path.find("/root/kaldera:KALDERA_FCPort.") != std::string::npos &&
               path.find("DeviceID=\"" + text_of(port, "DeviceID") + "\"") != std::string::npos &&
               path.find("SystemName=\"" + text_of(port, "SystemName") + "\"") != std::string::npos;
    };
    EXPECT_EQ(1, std::count_if(ports.instances.begin(), ports.instances.end(), is_named)) << path;
}

TEST_F(Alert_Indications, GoIntoEachNameSpaceWithAFilter)
{
    broker::Subscription subscription(*server, CLASS);
    for (const char* name_space : {"root/one", "root/two", "root/one"})
        ASSERT_EQ(CMPI_RC_OK, subscription.add(name_space));
    EXPECT_EQ(2u, subscription.count("root/one"));
    simulator.event(event(4, 1));
    ASSERT_TRUE(wait_for(2));
    let_pass();
    EXPECT_EQ((Texts{"root/one PROPKLDR262145", "root/two PROPKLDR262145"}), came());

    EXPECT_EQ(CMPI_RC_OK, subscription.remove("root/one"));
    simulator.event(event(4, 2));
    ASSERT_TRUE(wait_for(4));
    EXPECT_EQ(CMPI_RC_OK, subscription.remove("root/one"));
    simulator.event(event(4, 3));
    ASSERT_TRUE(wait_for(5));
    let_pass();
    EXPECT_EQ((Texts{"root/one PROPKLDR262145", "root/two PROPKLDR262145", "root/one PROPKLDR262146",
                     "root/two PROPKLDR262146", "root/two PROPKLDR262147"}),
              came());
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, subscription.remove("root/one"));
    EXPECT_EQ(CMPI_RC_OK, server->deactivate_filter(CLASS, "root/nowhere"));
}

TEST_F(Alert_Indications, WithoutAFilterAreDropped)
{
    ASSERT_EQ(CMPI_RC_OK, server->enable_indications(CLASS));
    EXPECT_TRUE(simulator.event(event(2, 1)));
    let_pass();
    ASSERT_EQ(CMPI_RC_OK, server->activate_filter(CLASS, "root/kaldera"));
    EXPECT_TRUE(simulator.event(event(4, 1)));
    ASSERT_TRUE(wait_for(1));
    EXPECT_EQ(Texts{"root/kaldera PROPKLDR262145"}, came());
    EXPECT_EQ(CMPI_RC_OK, server->deactivate_filter(CLASS, "root/kaldera"));
    EXPECT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
}

TEST_F(Alert_Indications, AreEnabledAndDisabledOnce)
{
    EXPECT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
    mark();
    for (int i = 0; i < 2; i++)
        EXPECT_EQ(CMPI_RC_OK, server->enable_indications(CLASS));
    EXPECT_EQ(2u, subscription_calls().size());
    for (int i = 0; i < 2; i++)
        EXPECT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
    EXPECT_EQ((Texts{"register_for_events", "registerEventProcessingCb", "registerEventProcessingCb",
                     "unregister_for_events"}),
              subscription_calls());
    EXPECT_FALSE(simulator.event(event(2, 1)));
}

TEST_F(Alert_Indications, ThatTheLibraryRefusesFailOnceUntilTheyAreDisabled)
{
    simulator.add_fault(R"({"call": "register_for_events", "do": "error", "times": 1})");
    mark();
    EXPECT_EQ(CMPI_RC_ERR_FAILED, server->enable_indications(CLASS));
    EXPECT_FALSE(simulator.status()["eventCallback"].asBool());
    EXPECT_EQ(CMPI_RC_OK, server->enable_indications(CLASS)) << "and does nothing";
    EXPECT_EQ(Texts{"register_for_events"}, subscription_calls());
    EXPECT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
    EXPECT_EQ(CMPI_RC_OK, server->enable_indications(CLASS));
    EXPECT_TRUE(simulator.status()["eventCallback"].asBool());
    EXPECT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
}

TEST_F(Alert_Indications, EndAlsoWhereTheLibraryRefusesTheEnd)
{
    simulator.add_fault(R"({"call": "unregister_for_events", "do": "throw"})");
    EXPECT_EQ(CMPI_RC_OK, server->enable_indications(CLASS));
    EXPECT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
    EXPECT_FALSE(simulator.status()["eventCallback"].asBool());
}

TEST_F(Alert_Indications, StopWhenTheModuleIsUnloadedWithoutDisabling)
{
    server->activate_filter(CLASS, "root/kaldera");
    server->enable_indications(CLASS);
    simulator.event(event(2, 1));
    ASSERT_TRUE(wait_for(1));
    // One server shuts down so. The library must not call into what is gone.
    server->unload(true);
    EXPECT_FALSE(simulator.status()["eventCallback"].asBool());
    EXPECT_FALSE(simulator.status()["wantsEvents"].asBool());
    EXPECT_FALSE(simulator.event(event(2, 1)));
}

TEST_F(Alert_Indications, LeftInTheQueueComeWithTheNextSubscription)
{
    // More than a second's worth, at one a pass: some are left, however late the delivery thread is told to
    // stop.
    constexpr int MANY = 60;
    server->activate_filter(CLASS, "root/kaldera");
    server->enable_indications(CLASS);
    Texts expected;
    for (int each = 0; each < MANY; each++) {
        const int id = each % 5 + 1;
        simulator.event(event(9, id));
        expected.push_back("root/kaldera PROPKLDR" + std::to_string(9 * 65536 + id));
    }
    server->disable_indications(CLASS);
    const std::size_t before = came().size();
    EXPECT_GT(MANY, before);
    let_pass();
    EXPECT_EQ(before, came().size());
    server->enable_indications(CLASS);
    ASSERT_TRUE(wait_for(MANY)) << before << " and then " << came().size();
    EXPECT_EQ(expected, came());
    server->disable_indications(CLASS);
}

TEST_F(Alert_Indications, FollowWhatChangesInTheAdapters)
{
    broker::Subscription subscription(*server, CLASS);
    subscription.add("root/kaldera");
    Json::Value request;
    request["indexStr"] = "10:00:02:4b:4c:10:00:00";
    request["port"]["portStatus"] = false;
    request["propArray"].append("portStatus");
    simulator.symbol<Json::Value(const Json::Value&)>("setPortByWwn")(request);
    ASSERT_TRUE(wait_for(2));
    EXPECT_EQ((Texts{"root/kaldera KLDR131080", "root/kaldera PROPKLDR131080"}), came());
    EXPECT_EQ("Base port disabled by user command.", text_of(alerts()[0], "Description"));
}

TEST_F(Alert_Indications, OfManyThreadsComeCompleteAndInOrder)
{
    broker::Subscription subscription(*server, CLASS);
    subscription.add("root/kaldera");
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; t++)
        threads.emplace_back([&] {
            for (int i = 0; i < 6; i++)
                simulator.event(event(5, 1));
        });
    for (std::thread& thread : threads)
        thread.join();
    ASSERT_TRUE(wait_for(24));
    const std::vector<broker::Instance_Value> list = alerts();
    for (size_t i = 1; i < list.size(); i++)
        EXPECT_EQ(list[0].property("SequenceNumber")->as_sint() + std::int64_t(i),
                  list[i].property("SequenceNumber")->as_sint());
}

TEST_F(Alert_Indications, OfWrongTypesAreAnExceptionInTheLibrary)
{
    broker::Subscription subscription(*server, CLASS);
    subscription.add("root/kaldera");
    EXPECT_THROW(simulator.event(R"({"eventCategory": "2", "eventId": 1})"), std::runtime_error);
    for (const char* text : {"", "no json", "{}", "[]", R"({"eventCategory": 2, "eventId": 3})"})
        EXPECT_TRUE(simulator.event(text)) << "taken, and dropped";
    simulator.event(event(4, 5));
    ASSERT_TRUE(wait_for(1));
    EXPECT_EQ(Texts{"root/kaldera PROPKLDR262149"}, came());
}

} // namespace
} // namespace KPRV

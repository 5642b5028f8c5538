#include "tests/faults/Fault_Fixture.h"
#include "tests/support/Eventually.h"
#include "tests/support/In_Child.h"

#include <atomic>
#include <dlfcn.h>
#include <thread>

namespace KPRV {
namespace {

class Broker_Refusals : public Fault_Fixture
{
protected:
    void SetUp() override { open("one_cna.json"); }

    /// The names of the calls that an operation makes, each with its number.
    template <class Operation>
    std::map<std::string, unsigned> calls_of(Operation&& operation)
    {
        server->calls().clear();
        server->calls().record(true);
        operation();
        server->calls().record(false);
        std::map<std::string, unsigned> counts;
        for (const std::string& call : server->calls().calls())
            ++counts[call.substr(0, call.find(' '))];
        return counts;
    }

    /// The operation with one call of each name failing, the first, one in the middle and the last, with a
    /// code or with an exception, as brokers written in C and in C++ do.
    template <class Operation>
    void refuse_each(const std::string& what, Operation&& operation)
    {
        for (const auto& [name, count] : calls_of(operation))
            refuse_some(what, name, count, operation);
    }

    template <class Operation>
    void refuse_some(const std::string& what, const std::string& name, unsigned count, Operation&& operation)
    {
        refuse(what, name, 1, false, operation);
        refuse(what, name, 1, true, operation);
        if (count > 1)
            refuse(what, name, (count + 2) / 2, false, operation);
        if (count > 2)
            refuse(what, name, count, true, operation);
    }

    template <class Operation>
    void refuse(const std::string& what, const std::string& name, unsigned nth, bool throws,
                Operation&& operation)
    {
        SCOPED_TRACE(what + ": " + name + " number " + std::to_string(nth) + (throws ? " throws" : " fails"));
        if (throws)
            server->calls().throw_at(name, nth);
        else
            server->calls().fail(name, nth, CMPI_RC_ERR_FAILED);
        operation();
        server->calls().mend();
        expect_nothing_left();
        ++refused;
    }

    unsigned refused = 0;
};

TEST_F(Broker_Refusals, OfAnEnumerationOfAnyClass)
{
    for (const std::string& name : classes)
        refuse_each("enumerate " + name, [&] { server->enumerate_instances(name); });
    EXPECT_LT(500u, refused);
}

TEST_F(Broker_Refusals, OfTheOtherOperations)
{
    const broker::Path_Value port = server->enumerate_instances("KALDERA_FCPort").instances.at(0).path;
    refuse_each("names", [&] { server->enumerate_instance_names("KALDERA_FCPort"); });
    refuse_each("get", [&] { server->get_instance(port); });
    refuse_each("get with a property list", [&] {
        server->get_instance(port, broker::Property_List{{"DeviceID", "Speed"}});
    });
    refuse_each("delete", [&] { server->delete_instance(port); });
    broker::Instance_Value changed;
    changed.path = port;
    broker::set_value(changed.properties, "ElementName", broker::Plain_Value::text("x"));
    refuse_each("modify", [&] { server->modify_instance(changed); });
    refuse_each("create", [&] { server->create_instance(changed); });
    EXPECT_LT(50u, refused);
}

TEST_F(Broker_Refusals, OfAssociations)
{
    const broker::Path_Value port = server->enumerate_instances("KALDERA_FCPort").instances.at(0).path;
    const std::string association = "KALDERA_FCPortSystemDevice";
    refuse_each("associators", [&] { server->associators(association, port, {}); });
    refuse_each("associator names", [&] { server->associator_names(association, port, {}); });
    refuse_each("references", [&] { server->references(association, port, {}); });
    refuse_each("reference names", [&] { server->reference_names(association, port, {}); });
    EXPECT_LT(50u, refused);
}

TEST_F(Broker_Refusals, OfAMethod)
{
    const broker::Path_Value alarm = server->enumerate_instances("KALDERA_AlarmDevice").instances.at(0).path;
    refuse_each("SetAlarmState", [&] {
        server->invoke_method(
            alarm, "SetAlarmState",
            {{"RequestedAlarmState", broker::Plain_Value::unsigned_number(CMPI_uint16, 1)}});
    });
    EXPECT_LT(10u, refused);
}

class Refused_Deliveries : public Broker_Refusals
{
protected:
    static constexpr const char* CLASS = "KALDERA_AlertIndication";

    void SetUp() override
    {
        // Alerts stay allocated; the leak checker can tell them only while the module is mapped.
        ASSERT_TRUE(dlopen(module_under_test(), RTLD_NOW | RTLD_NODELETE));
        Broker_Refusals::SetUp();
        server->set_sink([this](const std::string&, const broker::Instance_Value&) {
            ++came;
            return CMPI_RC_OK;
        });
        ASSERT_EQ(CMPI_RC_OK, server->activate_filter(CLASS, "root/kaldera"));
    }

    /// A subscription, an event of two alerts, and some patience, since not all that is refused comes.
    unsigned deliver(std::chrono::milliseconds patience = std::chrono::milliseconds(30))
    {
        const unsigned before = came;
        if (server->enable_indications(CLASS) == CMPI_RC_OK) {
            EXPECT_TRUE(simulator.event(
                R"({"eventSeverity": 2, "eventCategory": 2, "eventId": 11, "portIndexString": "10000024b4c200000"})"));
            const auto end = std::chrono::steady_clock::now() + patience;
            while (came < before + 2 && std::chrono::steady_clock::now() < end)
                std::this_thread::sleep_for(std::chrono::milliseconds(1));
        }
        EXPECT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
        return came - before;
    }
    static bool is_about_threads(const std::string& call) { return call.ends_with("Thread"); }

    std::atomic<unsigned> came = 0;
};

// What the server refuses of an alert is lost, and the delivery thread goes on.
TEST_F(Refused_Deliveries, LoseAnAlertAtMost)
{
    const auto operation = [this] { deliver(); };
    for (const auto& [name, count] : calls_of([this] { deliver(PATIENCE); }))
        if (!is_about_threads(name))
            refuse_some("delivery", name, count, operation);
    EXPECT_LT(10u, refused);
    EXPECT_LE(2u, deliver(PATIENCE));
    EXPECT_EQ(CMPI_RC_OK, server->deactivate_filter(CLASS, "root/kaldera"));
}

// A server that refuses to attach a thread, or to let it go, keeps what it had made for that thread. In a
// process of its own, since that never goes away.
TEST_F(Refused_Deliveries, OfAServerThatAttachesNoThreads)
{
    in_child([&] {
        unsigned calls = 0;
        for (const auto& [name, count] : calls_of([this] { deliver(PATIENCE); }))
            for (const bool throws : {false, true})
                if (is_about_threads(name)) {
                    SCOPED_TRACE(name + (throws ? " throws" : " fails"));
                    calls++;
                    if (throws)
                        server->calls().throw_at(name, 1);
                    else
                        server->calls().fail(name, 1, CMPI_RC_ERR_FAILED);
                    deliver();
                    server->calls().mend();
                    EXPECT_LE(2u, deliver(PATIENCE));
                    EXPECT_GE(calls, server->ledger().live(broker::Object_Kind::CONTEXT));
                }
        EXPECT_EQ(6u, calls);
    });
    EXPECT_EQ(CMPI_RC_OK, server->deactivate_filter(CLASS, "root/kaldera"));
}

} // namespace
} // namespace KPRV

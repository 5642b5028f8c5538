// Ten thousand events from the library's threads to a server's broker.
#include "broker/Mi_Call.h"
#include "broker/Registration_Catalogue.h"
#include "module/cmpi/CMPI_Adapter.h"
#include "module/cmpi/cimple_cmpi_adapter.h"
#include "tests/module/alerts/Alert_Delivery.h"
#include "tests/module/alerts/Event_Fixture.h"
#include "tests/support/Driver_Status_Override.h"

#include <thread>

namespace KPRV {
namespace {

/// A server with the one provider, in two name spaces.
class Alert_Server : private broker::Up_Calls
{
public:
    explicit Alert_Server(std::function<void(const std::string&, const broker::Instance_Value&)> sink)
        : core(std::make_shared<broker::Core>(broker::Server_Options{})), _sink(std::move(sink)),
          _catalogue(_cimple_registration_head), _broker(core, *this)
    {
        core->catalogue = &_catalogue;
        void* mi = nullptr;
        broker::Mi_Frame frame(_broker, {});
        cimple_cmpi_adapter('C', _area, alert_registration(), _broker.cmpi(), frame.context(),
                            alert_registration()->provider_name, 'N', &mi);
        _mi = static_cast<CMPIIndicationMI*>(mi);
    }
    ~Alert_Server() override
    {
        broker::Mi_Frame frame(_broker, {});
        _mi->ft->cleanup(_mi, frame.context(), 1);
    }

    void activate(const char* name_space)
    {
        broker::Mi_Frame frame(_broker, {});
        const broker::Argument<broker::Path_Object> path(
            *core, broker::Path_Value{"", name_space, "KALDERA_AlertIndication", {}});
        _mi->ft->activateFilter(_mi, frame.context(), nullptr, "", path.cmpi(), 1);
    }
    CMPIrc enable()
    {
        broker::Mi_Frame frame(_broker, {});
        return _mi->ft->enableIndications(_mi, frame.context()).rc;
    }
    CMPIrc disable()
    {
        broker::Mi_Frame frame(_broker, {});
        return _mi->ft->disableIndications(_mi, frame.context()).rc;
    }

    std::shared_ptr<broker::Core> core;

private:
    broker::Result up_call(const broker::Request&) override { return {.rc = CMPI_RC_ERR_NOT_FOUND}; }
    CMPIrc deliver(const std::string& name_space, const broker::Instance_Value& indication) override
    {
        _sink(name_space, indication);
        return CMPI_RC_OK;
    }

    std::function<void(const std::string&, const broker::Instance_Value&)> _sink;
    broker::Registration_Catalogue _catalogue;
    broker::Broker _broker;
    CMPIIndicationMI* _mi;
    alignas(16) unsigned char _area[STATIC_DATA_AREA] = {};
};

sint64 number_of(const broker::Instance_Value& alert)
{
    return alert.property("SequenceNumber")->as_sint();
}

TEST(Delivery_Load, TenThousandEventsOfFourThreadsReachTheServerAndLeaveNothingBehind)
{
    const Fixed_Host host;
    const Driver_Status_Override driver(0);
    Fake_Library library;
    library.answers("register_for_events", json("{}"));
    library.answers("unregister_for_events", json("{}"));
    const Delivery_Pause_Override pause([](uint64) {});

    constexpr int THREADS = 4;
    constexpr int EVENTS = 2500;
    std::vector<sint64> numbers;
    std::vector<size_t> live;
    std::atomic<size_t> count = 0;
    Alert_Server server([&](const std::string& name_space, const broker::Instance_Value& alert) {
        EXPECT_EQ("root/kaldera", name_space);
        numbers.push_back(number_of(alert));
        // The objects of the delivery under way are among them, always the same.
        live.push_back(server.core->ledger.live());
        ++count;
    });
    server.activate("root/kaldera");
    ASSERT_EQ(CMPI_RC_OK, server.enable());
    const evtProcessCB callback = library.event_callback;
    ASSERT_TRUE(callback);
    std::vector<std::thread> threads;
    for (int t = 0; t < THREADS; t++)
        threads.emplace_back([&] {
            for (int i = 0; i < EVENTS; i++)
                callback(R"({"eventCategory": 9, "eventId": 2, "eventSeverity": 1, "eventMsg": "stopped",
                             "eventIdValue": "ZNT_IOC_HBFAIL", "basePortWWN": "10:00:02:4b:4c:10:00:00"})");
        });
    for (std::thread& thread : threads)
        thread.join();
    while (count < THREADS * EVENTS)
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    EXPECT_EQ(CMPI_RC_OK, server.disable());

    ASSERT_EQ(size_t(THREADS * EVENTS), numbers.size());
    for (size_t i = 1; i < numbers.size(); i++)
        ASSERT_EQ(numbers[0] + sint64(i), numbers[i]);
    EXPECT_EQ(std::vector<size_t>(live.size(), live[0]), live);
    EXPECT_EQ("", server.core->violations.text());
    EXPECT_EQ(0u, server.core->ledger.live());
}

TEST(Delivery_Load, EndsInTheMiddleOfAStorm)
{
    // The worker may need the adapter just while the operation that holds it waits for the worker's end.
    const Fixed_Host host;
    const Driver_Status_Override driver(0);
    Fake_Library library;
    library.answers("register_for_events", json("{}"));
    library.answers("unregister_for_events", [](const Json::Value&) {
        std::this_thread::sleep_for(std::chrono::milliseconds(2));
        return json("{}");
    });
    const Delivery_Pause_Override pause([](uint64) { std::this_thread::yield(); });
    std::atomic<int> count = 0;
    {
        Alert_Server server([&](const std::string&, const broker::Instance_Value&) { ++count; });
        server.activate("root/one");
        server.activate("root/two");
        for (int i = 0; i < 20; i++) {
            ASSERT_EQ(CMPI_RC_OK, server.enable());
            for (int j = 0; j < 50; j++)
                library.event_callback(R"({"eventCategory": 4, "eventId": 1, "eventSeverity": 4})");
            ASSERT_EQ(CMPI_RC_OK, server.disable());
        }
        // What was left over comes with the next subscription, all of it in both name spaces.
        ASSERT_EQ(CMPI_RC_OK, server.enable());
        while (count < 20 * 50 * 2)
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
        // No disabling: the cleanup ends it.
    }
    EXPECT_EQ(2000, count);
    EXPECT_EQ(nullptr, library.event_callback);
}

} // namespace
} // namespace KPRV

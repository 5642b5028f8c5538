// The provider as the CMPI adapter calls it: subscription, delivery thread and end.
#include "tests/module/alerts/Alert_Delivery.h"
#include "tests/module/alerts/Event_Fixture.h"
#include "tests/support/Eventually.h"

#include "module/runtime/dispatch/Provider_Handle.h"
#include "module/runtime/dispatch/provider_status.h"
#include "tests/support/Driver_Status_Override.h"

#include <algorithm>
#include <chrono>
#include <condition_variable>
#include <mutex>
#include <thread>

namespace KPRV {
namespace {

using Clock = std::chrono::steady_clock;

/// What the server's handler is given, in order.
struct Received
{
    std::mutex mutex;
    std::condition_variable came;
    std::vector<Alert> alerts;
    std::vector<int> passes;
    struct Span
    {
        Clock::time_point begin, end;
    };
    std::vector<Span> spans;
    /// How long the server takes for each.
    std::chrono::milliseconds takes{0};
    int end_marks = 0;
    bool was_last_an_end_mark = false;
    bool throws = false;
    std::thread::id thread;

    static bool handle(Instance* instance, void* data)
    {
        auto& self = *static_cast<Received*>(data);
        const std::lock_guard lock(self.mutex);
        self.was_last_an_end_mark = !instance;
        if (!instance) {
            self.end_marks++;
            return false;
        }
        self.thread = std::this_thread::get_id();
        const Clock::time_point begin = Clock::now();
        std::this_thread::sleep_for(self.takes);
        self.spans.push_back({begin, Clock::now()});
        self.alerts.emplace_back(static_cast<KALDERA_AlertIndication*>(instance));
        self.passes.push_back(Short_Pauses::count);
        self.came.notify_all();
        if (self.throws)
            throw std::runtime_error("the server is out of order");
        return true;
    }
    bool wait_for(size_t count)
    {
        std::unique_lock lock(mutex);
        return came.wait_for(lock, PATIENCE, [&] { return alerts.size() >= count; });
    }
    std::vector<std::string> ids()
    {
        const std::lock_guard lock(mutex);
        return texts_of(alerts, "MessageID");
    }
};

class Alert_Provider : public Event_Fixture
{
protected:
    Alert_Provider()
    {
        library.answers("register_for_events", json("{'status': 0}"));
        library.answers("unregister_for_events", json("{'status': 0}"));
        log.clear();
    }
    ~Alert_Provider() override
    {
        provider.unload();
        EXPECT_EQ(0, Short_Pauses::strange);
        take_alerts(gIndicationHelperObj);
    }

    int enable() { return provider.enable_indications(Received::handle, &received); }
    int disable() { return provider.disable_indications(); }
    /// As the library tells it; nothing if it is not to.
    void happen(int category, int id)
    {
        if (library.event_callback)
            library.event_callback(text(category, id, R"("eventSeverity": 4)").c_str());
    }
    Lines told(const char* level) { return log.said(level); }

    const Short_Pauses pauses;
    const Driver_Status_Override driver{0};
    Received received;
    Provider_Handle provider{alert_registration()};
};

TEST_F(Alert_Provider, TellsTheLogThatItIsLoadedAndUnloaded)
{
    EXPECT_EQ(LOAD_OK, provider.load());
    EXPECT_EQ(UNLOAD_OK, provider.unload());
    EXPECT_EQ((Lines{"DBG KALDERA_AlertIndication_Provider::load()",
                     "DBG KALDERA_AlertIndication_Provider::unload()"}),
              log.said());
    EXPECT_TRUE(library.calls.empty()) << "nothing to stop";
}

TEST_F(Alert_Provider, DeliversEventsUntilItIsDisabled)
{
    EXPECT_EQ(ENABLE_INDICATIONS_OK, enable());
    EXPECT_EQ(Lines{"INFO Subscribtion for event notifications is successful."}, told("INFO"));
    happen(2, 1);
    ASSERT_TRUE(received.wait_for(2));
    EXPECT_EQ((std::vector<std::string>{"KLDR131073", "PROPKLDR131073"}), received.ids());
    EXPECT_NE(std::this_thread::get_id(), received.thread) << "never on the library's thread";
    EXPECT_EQ(0, received.end_marks);
    log.clear();
    library.calls.clear();
    EXPECT_EQ(DISABLE_INDICATIONS_OK, disable());
    EXPECT_EQ((Lines{"registerEventProcessingCb false", "unregister_for_events null"}), library.told());
    EXPECT_TRUE(log.has("INFO Unsubscribtion for event notifications is successful."));
    EXPECT_TRUE(log.has("INFO Stopping the indication thread created."));
    EXPECT_EQ(1, received.end_marks);
    EXPECT_TRUE(received.was_last_an_end_mark);
    happen(2, 1);
    EXPECT_EQ(2u, received.alerts.size());
}

TEST_F(Alert_Provider, SaysOfEachDeliveryThatItWasMade)
{
    enable();
    happen(2, 1);
    received.wait_for(2);
    disable();
    const Lines lines = told("INFO Delivered");
    EXPECT_EQ(
        (Lines{"INFO Delivered indication to the CIM server", "INFO Delivered indication to the CIM server"}),
        lines);
}

TEST_F(Alert_Provider, DeliversOneAlertAPass)
{
    enable();
    for (int i = 0; i < 5; i++)
        happen(2, 1);
    ASSERT_TRUE(received.wait_for(10));
    disable();
    for (size_t i = 1; i < received.passes.size(); i++)
        EXPECT_GT(received.passes[i], received.passes[i - 1]);
    const sint64 first = received.alerts[0]->SequenceNumber.value;
    for (size_t i = 0; i < received.alerts.size(); i++)
        EXPECT_EQ(first + sint64(i), received.alerts[i]->SequenceNumber.value);
}

TEST_F(Alert_Provider, LeavesTwentyMillisecondsBetweenAlertsHoweverLongADeliveryTakes)
{
    const Delivery_Pause_Override products_own(Time::sleep);
    for (const int takes : {0, 15, 25}) {
        received.takes = std::chrono::milliseconds(takes);
        received.spans.clear();
        received.alerts.clear();
        enable();
        for (int i = 0; i < 3; i++)
            happen(2, 1);
        ASSERT_TRUE(received.wait_for(6));
        disable();
        for (size_t i = 1; i < received.spans.size(); i++)
            EXPECT_GE(received.spans[i].begin - received.spans[i - 1].end, std::chrono::milliseconds(20))
                << takes;
    }
}

TEST_F(Alert_Provider, WithoutADriverRefuses)
{
    const Driver_Status_Override absent(2);
    EXPECT_EQ(ENABLE_INDICATIONS_FAILED, enable());
    EXPECT_EQ(
        (Lines{"ERR Driver is not installed or there is a zntl mismatch. Will not invoke subscription. ",
               "ERR Subscribtion for event notifications FAILED."}),
        told("ERR"));
    EXPECT_TRUE(library.calls.empty());
    log.clear();
    EXPECT_EQ(DISABLE_INDICATIONS_OK, disable());
    EXPECT_EQ(Lines{"INFO No subscription for event notifications happened or successful"}, log.said());
    EXPECT_TRUE(library.calls.empty());
    EXPECT_EQ(0, received.end_marks) << "the handler was not kept";
    EXPECT_EQ(0, Short_Pauses::count) << "no thread";
}

TEST_F(Alert_Provider, RefusesWhatTheLibraryRefuses)
{
    library.answers("register_for_events", json("{'error': {'code': 1}}"));
    EXPECT_EQ(ENABLE_INDICATIONS_FAILED, enable());
    EXPECT_EQ(Lines{"ERR Subscribtion for event notifications FAILED."}, told("ERR"));
    EXPECT_EQ(DISABLE_INDICATIONS_OK, disable());
    EXPECT_EQ(0u, library.count("unregister_for_events"));
    library.answers("register_for_events", json("{}"));
    EXPECT_EQ(ENABLE_INDICATIONS_OK, enable()) << "a later attempt may succeed";
    EXPECT_EQ(DISABLE_INDICATIONS_OK, disable());
}

TEST_F(Alert_Provider, EndsAlsoWhereTheLibraryRefusesTheEnd)
{
    library.answers("unregister_for_events", Json::Value());
    enable();
    log.clear();
    EXPECT_EQ(DISABLE_INDICATIONS_OK, disable());
    EXPECT_EQ(Lines{"ERR Un-subscribtion for event notifications FAILED."}, told("ERR"));
    EXPECT_EQ((Lines{"INFO Continue to stop the thread created for listening to events",
                     "INFO Stopping the indication thread created."}),
              told("INFO"));
    EXPECT_EQ(1, received.end_marks);
    EXPECT_EQ(nullptr, library.event_callback);
}

TEST_F(Alert_Provider, IsDisabledOnce)
{
    EXPECT_EQ(DISABLE_INDICATIONS_OK, disable());
    enable();
    disable();
    library.calls.clear();
    log.clear();
    EXPECT_EQ(DISABLE_INDICATIONS_OK, disable());
    EXPECT_EQ(Lines{"INFO No subscription for event notifications happened or successful"}, log.said());
    EXPECT_TRUE(library.calls.empty());
    EXPECT_EQ(1, received.end_marks);
}

TEST_F(Alert_Provider, StopsWhenItIsUnloadedWithASubscription)
{
    enable();
    happen(2, 1);
    received.wait_for(2);
    log.clear();
    EXPECT_EQ(UNLOAD_OK, provider.unload());
    EXPECT_EQ("DBG KALDERA_AlertIndication_Provider::unload()", log.said().at(0));
    EXPECT_TRUE(log.has("INFO Stopping the indication thread created."));
    EXPECT_EQ(1, received.end_marks);
    EXPECT_EQ(nullptr, library.event_callback);
    const int passes = Short_Pauses::count;
    std::this_thread::sleep_for(std::chrono::milliseconds(5));
    EXPECT_EQ(passes, Short_Pauses::count) << "the thread has ended";
}

TEST_F(Alert_Provider, KeepsWhatIsLeftForTheNextSubscription)
{
    // The queue belongs to the helper: what comes without a subscription waits.
    providerHandleEvent(text(2, 1, R"("eventSeverity": 4)").c_str());
    providerHandleEvent(text(4, 1, R"("eventSeverity": 4)").c_str());
    enable();
    ASSERT_TRUE(received.wait_for(3));
    disable();
    EXPECT_EQ((std::vector<std::string>{"KLDR131073", "PROPKLDR131073", "PROPKLDR262145"}).size(),
              received.ids().size());
    EXPECT_EQ("PROPKLDR262145", received.ids().back());
}

TEST_F(Alert_Provider, CarriesOnWhereTheServerThrows)
{
    received.throws = true;
    enable();
    happen(2, 1);
    ASSERT_TRUE(received.wait_for(2));
    disable();
    const Lines lost = told("ERR");
    EXPECT_EQ((Lines{"ERR deliverIndications got std exception: the server is out of order",
                     "ERR deliverIndications got std exception: the server is out of order"}),
              lost);
    EXPECT_TRUE(told("INFO Delivered").empty());
}

TEST_F(Alert_Provider, TracesTheDeliveryThread)
{
    enable();
    disable();
    const Lines traces = log.traces();
    EXPECT_NE(traces.end(), std::ranges::find(traces, "DBG Entering: deliverIndications"));
    EXPECT_NE(traces.end(), std::ranges::find(traces, "DBG Returning: deliverIndications"));
}

TEST_F(Alert_Provider, CanBeEnabledAndDisabledAgainAndAgain)
{
    for (int i = 0; i < 50; i++) {
        ASSERT_EQ(ENABLE_INDICATIONS_OK, enable());
        happen(4, 1);
        ASSERT_EQ(DISABLE_INDICATIONS_OK, disable());
    }
    enable();
    ASSERT_TRUE(received.wait_for(50)) << "nothing is lost in between";
    disable();
    EXPECT_EQ(51, received.end_marks);
}

} // namespace
} // namespace KPRV

// The subscription with the library, and the queue.
#include "tests/module/alerts/Event_Fixture.h"

#include "module/alerts/IndicationManager.h"
#include "tests/support/Driver_Status_Override.h"

#include <pthread.h>
#include <thread>

static thread_local unsigned locks_taken = 0;

// The linker puts it in the place of the C library's.
extern "C" int __real_pthread_mutex_lock(pthread_mutex_t* mutex);
extern "C" int __wrap_pthread_mutex_lock(pthread_mutex_t* mutex)
{
    locks_taken++;
    return __real_pthread_mutex_lock(mutex);
}

namespace KPRV {
namespace {

class Subscriptions : public Event_Fixture
{
protected:
    Subscriptions()
    {
        library.answers("register_for_events", json("{'status': 0}"));
        library.answers("unregister_for_events", json("{'status': 0}"));
    }
    bool is_known() const { return !(helper.getEventCauseById(event_key(2, 1)) == "Unknown"); }
};

const Lines subscription = {R"(register_for_events {"dropOldEvents":true})",
                            "registerEventProcessingCb true"};
const Lines refused_subscription = {R"(register_for_events {"dropOldEvents":true})"};
const Lines end_of_subscription = {"registerEventProcessingCb false", "unregister_for_events null"};

TEST_F(Subscriptions, RegisterThenArmThenFillTheCatalogue)
{
    helper.clearEventDetailsMaps();
    bool was_known = true;
    library.on_event_callback = [&] { was_known = is_known(); };
    EXPECT_TRUE(helper.subscribeForEventNotifications());
    EXPECT_EQ(subscription, library.told());
    EXPECT_EQ(providerHandleEvent, library.event_callback);
    EXPECT_FALSE(was_known) << "an event may come before the catalogue is there";
    EXPECT_TRUE(is_known());
}

TEST_F(Subscriptions, EndWithTheCallbackFirst)
{
    helper.subscribeForEventNotifications();
    library.calls.clear();
    EXPECT_TRUE(helper.unsubscribeForEventNotifications());
    EXPECT_EQ(end_of_subscription, library.told());
    EXPECT_EQ(nullptr, library.event_callback);
    EXPECT_FALSE(is_known());
}

TEST_F(Subscriptions, ThatTheLibraryRefusesAreNotArmed)
{
    helper.clearEventDetailsMaps();
    const auto refused = [&] {
        library.calls.clear();
        EXPECT_FALSE(helper.subscribeForEventNotifications());
        EXPECT_EQ(refused_subscription, library.told());
        EXPECT_EQ(nullptr, library.event_callback);
        EXPECT_FALSE(is_known());
    };
    library.answers("register_for_events", Json::Value());
    refused();
    library.answers("register_for_events", json("{'error': null}"));
    refused();
    library.throws("register_for_events", HbaAgentError{7, "busy"});
    refused();
    EXPECT_EQ(Lines{"ERR libRegisterForEvents got User exception 7: busy"}, log.said("ERR"));
    library.throws("register_for_events", 5);
    refused();
}

TEST_F(Subscriptions, AreWhateverElseTheLibraryAnswers)
{
    for (const char* answer : {"{}", "[]", "0", "false", "'error'"}) {
        library.answers("register_for_events", json(answer));
        EXPECT_TRUE(helper.registerForEvents()) << answer;
    }
}

TEST_F(Subscriptions, WhoseEndIsRefusedEndAllTheSame)
{
    for (const int way : {0, 1, 2}) {
        helper.subscribeForEventNotifications();
        library.calls.clear();
        if (way == 0)
            library.answers("unregister_for_events", Json::Value());
        else if (way == 1)
            library.answers("unregister_for_events", json("{'error': {'code': 1}}"));
        else
            library.throws("unregister_for_events", std::runtime_error("lost"));
        EXPECT_FALSE(helper.unsubscribeForEventNotifications());
        EXPECT_EQ(end_of_subscription, library.told());
        EXPECT_EQ(nullptr, library.event_callback);
        EXPECT_FALSE(is_known());
    }
}

TEST_F(Subscriptions, NeedADriver)
{
    IndicationManager* const manager = IndicationManager::getIndicationManager();
    for (const sint32 status : {2, 3}) {
        log.clear();
        const Driver_Status_Override driver(status);
        EXPECT_FALSE(manager->subscribeForEventNotifications());
        EXPECT_TRUE(library.calls.empty());
        EXPECT_EQ(Lines{"ERR Driver is not installed or there is a zntl mismatch. Will not invoke "
                        "subscription. "},
                  log.said());
    }
    for (const sint32 status : {0, 1, 4}) {
        library.calls.clear();
        const Driver_Status_Override driver(status);
        EXPECT_TRUE(manager->subscribeForEventNotifications());
        EXPECT_EQ(subscription, library.told());
    }
    const Driver_Status_Override driver(2);
    library.calls.clear();
    EXPECT_TRUE(manager->unsubscribeForEventNotifications()) << "an end needs none";
    EXPECT_EQ(end_of_subscription, library.told());
}

TEST_F(Subscriptions, HaveOneManagerThatSpeaksForTheHelper)
{
    EXPECT_EQ(&gIndicationManagerObj, IndicationManager::getIndicationManager());
    KALDERA_AlertIndication* alert = nullptr;
    EXPECT_FALSE(gIndicationManagerObj.getIndicationObject(&alert));
    providerHandleEvent(text(4, 1).c_str());
    ASSERT_TRUE(gIndicationManagerObj.getIndicationObject(&alert));
    EXPECT_EQ("PROPKLDR262145", text_of(Alert(alert), "MessageID"));
}

TEST_F(Subscriptions, TellTheLogOfTheLivesOfTheirObjects)
{
    {
        const IndicationManager manager;
        const IndicationHelper other;
    }
    EXPECT_EQ((Lines{"DBG Inside IndicationManager Constructor", "DBG IndicatoinHelper destructor.",
                     "DBG Destructor for class IndicationManager"}),
              log.said());
}

class Alert_Queue : public Event_Fixture
{
};

TEST_F(Alert_Queue, GivesWhatCameFirst)
{
    KALDERA_AlertIndication* alert = nullptr;
    EXPECT_FALSE(helper.getIndicationObject(&alert));
    EXPECT_EQ(nullptr, alert);
    helper.processEvent(text(2, 1).c_str());
    helper.processEvent(text(9, 2).c_str());
    EXPECT_EQ((std::vector<std::string>{"KLDR131073", "PROPKLDR131073", "PROPKLDR589826"}),
              texts_of(take_alerts(helper), "MessageID"));
    EXPECT_FALSE(helper.getIndicationObject(&alert));
}

TEST_F(Alert_Queue, IsPolledWithoutALockWhileItIsEmpty)
{
    const auto locks_of_a_poll = [this](bool expected) {
        const unsigned before = locks_taken;
        KALDERA_AlertIndication* alert = nullptr;
        EXPECT_EQ(expected, helper.getIndicationObject(&alert));
        const unsigned locks = locks_taken - before;
        const Alert owner(alert);
        return locks;
    };
    EXPECT_EQ(0u, locks_of_a_poll(false));
    helper.processEvent(text(2, 1).c_str());
    EXPECT_EQ(1u, locks_of_a_poll(true));
    EXPECT_EQ(1u, locks_of_a_poll(true));
    EXPECT_EQ(0u, locks_of_a_poll(false));
}

TEST_F(Alert_Queue, NumbersAlertsWithoutAGapAcrossHelpersAndSubscriptions)
{
    const auto number = [](const Alert& alert) { return alert->SequenceNumber.value; };
    const sint64 first = number(alerts_of(4, 1).at(0));
    EXPECT_GE(first, 1);
    EXPECT_EQ(0, alerts_of(2, 1).at(0)->SequenceNumber.null);
    alerts_of(2, 3);
    helper.unsubscribeForEventNotifications();
    helper.subscribeForEventNotifications();
    const std::vector<Alert> alerts = alerts_of(2, 1);
    EXPECT_EQ(first + 3, number(alerts.at(0)));
    EXPECT_EQ(first + 4, number(alerts.at(1)));
}

TEST_F(Alert_Queue, KeepsAlertsThroughTheEndOfASubscription)
{
    helper.processEvent(text(4, 1).c_str());
    helper.unsubscribeForEventNotifications();
    EXPECT_EQ(1u, take_alerts(helper).size());
}

TEST(Alert_Queue_Load, TakesTenThousandEventsOfFourThreadsCompleteAndInOrder)
{
    const Fixed_Host host;
    IndicationHelper helper;
    helper.initEventDetailsMaps();
    constexpr int THREADS = 4;
    constexpr int EVENTS = 2500;
    std::vector<std::thread> threads;
    for (int t = 0; t < THREADS; t++)
        threads.emplace_back([&, t] {
            for (int i = 0; i < EVENTS; i++) {
                const std::string number = std::to_string(t * EVENTS + i);
                helper.processEvent(
                    (R"({"eventCategory": 2, "eventId": 1, "eventSeverity": 4, "eventMsg": ")" + number +
                     "\"}")
                        .c_str());
            }
        });
    // Taken out while they come in, as the delivery thread does it.
    std::vector<Alert> alerts;
    while (alerts.size() < 2 * THREADS * EVENTS) {
        for (Alert& each : take_alerts(helper))
            alerts.push_back(std::move(each));
        std::this_thread::yield();
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_TRUE(take_alerts(helper).empty());

    std::vector<int> last_of_thread(THREADS, -1);
    std::vector<int> times(THREADS * EVENTS, 0);
    const sint64 first = alerts[0]->SequenceNumber.value;
    for (size_t i = 0; i < alerts.size(); i++) {
        ASSERT_EQ(first + sint64(i), alerts[i]->SequenceNumber.value);
        const int number = atoi(alerts[i]->Message.value.c_str());
        times[number]++;
        // The events of one thread stay in order, each with its standard alert first.
        const int position = 2 * (number % EVENTS) + (alerts[i]->MessageID.value.c_str()[0] == 'P');
        EXPECT_GT(position, last_of_thread[number / EVENTS]);
        last_of_thread[number / EVENTS] = position;
    }
    EXPECT_EQ(times, std::vector<int>(THREADS * EVENTS, 2));
}

} // namespace
} // namespace KPRV

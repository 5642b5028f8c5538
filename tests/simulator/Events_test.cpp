#include "tests/simulator/Simulator_Fixture.h"
#include "tests/support/Eventually.h"
#include "tests/support/Temp_Folder.h"

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <mutex>
#include <stdexcept>
#include <thread>

namespace KPRV::simulator {
namespace {

using namespace std::chrono_literals;
using Texts = std::vector<std::string>;

/// What a receiver was told, and on which threads.
struct Inbox
{
    std::mutex mutex;
    std::condition_variable came;
    Texts texts;
    std::vector<std::thread::id> threads;
    std::atomic<bool> is_inside = false;
    std::chrono::milliseconds stay{0};

    bool wait_for(std::size_t count)
    {
        std::unique_lock lock(mutex);
        return came.wait_for(lock, PATIENCE, [&] { return texts.size() >= count; });
    }
    Texts told()
    {
        const std::lock_guard lock(mutex);
        return texts;
    }
};

Inbox* inbox;

void receive(const char* text)
{
    inbox->is_inside = true;
    {
        const std::lock_guard lock(inbox->mutex);
        inbox->texts.emplace_back(text);
        inbox->threads.push_back(std::this_thread::get_id());
        inbox->came.notify_all();
    }
    std::this_thread::sleep_for(inbox->stay);
    inbox->is_inside = false;
}

void receive_and_throw(const char* text)
{
    receive(text);
    throw std::runtime_error("not for me");
}

class Events : public Simulator_Fixture
{
protected:
    Events() { inbox = &box; }
    ~Events() override
    {
        set_callback(nullptr);
        integer("free_hba_lib");
    }

    void set_callback(void (*callback)(const char*))
    {
        simulator.symbol<void(void (*)(const char*))>("registerEventProcessingCb")(callback);
    }
    void want(bool drop = true)
    {
        Json::Value request;
        request["dropOldEvents"] = drop;
        EXPECT_EQ(call("register_for_events", request), json("{'status': 0}"));
    }
    void subscribe(bool drop = true)
    {
        want(drop);
        set_callback(receive);
    }
    void unsubscribe()
    {
        set_callback(nullptr);
        call("unregister_for_events");
    }

    Inbox box;
};

TEST_F(Events, OfAScriptComeInOrderOnAThreadOfTheLibrary)
{
    simulator.load_text(R"({"events": [{"after": 5, "event": {"eventId": 1}},
                                       {"times": 3, "every": 2, "text": "not {json"},
                                       {"event": [2]}]})");
    subscribe();
    ASSERT_TRUE(box.wait_for(5));
    EXPECT_EQ(box.told(), (Texts{R"({"eventId":1})", "not {json", "not {json", "not {json", "[2]"}));
    EXPECT_NE(box.threads.at(0), std::this_thread::get_id());
}

TEST_F(Events, OfAScriptComeAnewWithEachRegistration)
{
    simulator.load_text(R"({"events": [{"text": "a"}, {"text": "b"}]})");
    subscribe();
    ASSERT_TRUE(box.wait_for(2));
    unsubscribe();
    subscribe();
    ASSERT_TRUE(box.wait_for(4));
    EXPECT_EQ(box.told(), (Texts{"a", "b", "a", "b"}));
}

TEST_F(Events, OfAScriptTakeTheirTime)
{
    simulator.load_text(R"({"events": [{"after": 30, "text": "a"}, {"after": 30, "text": "b"}]})");
    const auto begin = std::chrono::steady_clock::now();
    subscribe();
    ASSERT_TRUE(box.wait_for(2));
    EXPECT_GE(std::chrono::steady_clock::now() - begin, 60ms);
}

TEST_F(Events, AreWantedByNobodyWithoutBothRegistrations)
{
    simulator.load_text(R"({"events": [{"text": "a"}]})");
    set_callback(receive);
    std::this_thread::sleep_for(10ms);
    EXPECT_TRUE(box.told().empty());
    want();
    EXPECT_TRUE(box.wait_for(1));
}

TEST_F(Events, StopWithTheRegistration)
{
    simulator.load_text(R"({"events": [{"text": "a"}, {"after": 20, "text": "b"}]})");
    // On a busy machine the second may come before it can be stopped.
    Texts told;
    std::chrono::steady_clock::duration took;
    do {
        const auto begin = std::chrono::steady_clock::now();
        const std::size_t before = box.told().size();
        subscribe();
        ASSERT_TRUE(box.wait_for(before + 1));
        call("unregister_for_events");
        took = std::chrono::steady_clock::now() - begin;
        std::this_thread::sleep_for(40ms);
        const Texts all = box.told();
        told.assign(all.begin() + static_cast<std::ptrdiff_t>(before), all.end());
    } while (took >= 20ms);
    EXPECT_EQ(told, Texts{"a"});
}

TEST_F(Events, ThatNobodyWasToldAreDroppedOrToldFirst)
{
    simulator.queue_event("old");
    subscribe(true);
    simulator.queue_event("new");
    ASSERT_TRUE(box.wait_for(1));
    EXPECT_EQ(box.told(), Texts{"new"});
    unsubscribe();
    simulator.queue_event("kept");
    subscribe(false);
    ASSERT_TRUE(box.wait_for(2));
    EXPECT_EQ(box.told(), (Texts{"new", "kept"}));
}

TEST_F(Events, AreNotKeptWithoutLimit)
{
    for (int i = 0; i < 1100; i++)
        simulator.queue_event(std::to_string(i));
    subscribe(false);
    ASSERT_TRUE(box.wait_for(1024));
    EXPECT_EQ(box.told().front(), "76");
}

TEST_F(Events, DoNotComeAfterTheCallbackIsGone)
{
    box.stay = 20ms;
    // On a busy machine the call may end before the callback is taken away.
    Texts told;
    bool was_inside;
    do {
        const std::size_t before = box.told().size();
        subscribe();
        simulator.queue_event("long");
        ASSERT_TRUE(box.wait_for(before + 1));
        simulator.queue_event("late");
        was_inside = box.is_inside;
        const auto begin = std::chrono::steady_clock::now();
        set_callback(nullptr);
        was_inside = was_inside && std::chrono::steady_clock::now() - begin > 1ms;
        EXPECT_FALSE(box.is_inside) << "the call in progress has ended";
        std::this_thread::sleep_for(10ms);
        const Texts all = box.told();
        told.assign(all.begin() + static_cast<std::ptrdiff_t>(before), all.end());
        call("unregister_for_events");
    } while (!was_inside);
    EXPECT_EQ(told, Texts{"long"});
}

TEST_F(Events, SurviveAReceiverThatThrows)
{
    want();
    set_callback(receive_and_throw);
    simulator.queue_event("a");
    simulator.queue_event("b");
    ASSERT_TRUE(box.wait_for(2));
    EXPECT_THROW(simulator.event("c"), std::runtime_error);
    EXPECT_EQ(box.told(), (Texts{"a", "b", "c"}));
    set_callback(nullptr);
}

TEST_F(Events, OfAFileStandInForThoseOfTheInventory)
{
    const Temp_Folder folder;
    folder.write("events.json", R"([{"text": "from the file"}])");
    folder.write("inventory.json", R"({"events": [{"text": "from the inventory"}]})");
    const Environment_Override events("KLDR_SIMULATOR_EVENTS", folder.path("events.json"));
    const Environment_Override inventory("KLDR_SIMULATOR_INVENTORY", folder.path("inventory.json"));
    simulator.reset();
    call("getAllAdaptersIndexString");
    subscribe();
    ASSERT_TRUE(box.wait_for(1));
    EXPECT_EQ(box.told(), Texts{"from the file"});
}

TEST_F(Events, HaveAShapeThatIsChecked)
{
    for (const char* events :
         {R"({})", R"([1])", R"([{}])", R"([{"event": 1, "text": "a"}])", R"([{"text": 1}])",
          R"([{"text": "a", "after": -1}])", R"([{"text": "a", "often": 1}])"})
        EXPECT_THROW(simulator.load_text(std::string(R"({"events": )") + events + "}"), std::runtime_error)
            << events;
    EXPECT_EQ(error_code(call("register_for_events", "{'dropOldEvents': 1}")), 1);
}

/// Events of changes, as "category/id address symbol".
class State_Events : public Events
{
protected:
    State_Events()
    {
        simulator.load_text(R"({"adapters": [
            {"hbaData": {"hbaMAC": "02:4b:4c:20:00:ff", "wwn": "20:00:02:4b:4c:20:00:00"},
             "fcPorts": [{"wwn": "10:00:02:4b:4c:20:00:00"}], "ethPorts": [{"mac": "02:4b:4c:20:00:00"}]}]})");
        subscribe();
    }
    /// What the request makes the library tell.
    Texts told_by(const char* name, const char* request, std::size_t count = 1)
    {
        const std::size_t before = box.told().size();
        EXPECT_EQ(error_code(call(name, request)), 0) << request;
        // The mark comes behind whatever the request has caused.
        simulator.queue_event("{}");
        EXPECT_TRUE(box.wait_for(before + count + 1));
        Texts result;
        const Texts all = box.told();
        for (std::size_t i = before; i < all.size() && all[i] != "{}"; i++) {
            const Json::Value event = parsed(all[i]);
            EXPECT_TRUE(event["eventSeverity"].isInt() && event["eventMsg"].isString());
            result.push_back(event["eventCategory"].asString() + "/" + event["eventId"].asString() + " " +
                             event["portIndexString"].asString() + " " + event["eventIdValue"].asString());
        }
        return result;
    }
};

TEST_F(State_Events, OfPortsAndAdaptersAreToldWhenTheyChange)
{
    const char* off = "{'indexStr': '10:00:02:4b:4c:20:00:00', 'port': {'portStatus': false}, "
                      "'propArray': ['portStatus']}";
    const char* on = "{'indexStr': '10:00:02:4b:4c:20:00:00', 'port': {'portStatus': true}, "
                     "'propArray': ['portStatus']}";
    EXPECT_EQ(told_by("setPortByWwn", on, 0), Texts{});
    EXPECT_EQ(told_by("setPortByWwn", off), Texts{"2/8 1000024b4c200000 ZNT_PORT_DISABLE"});
    EXPECT_EQ(told_by("setPortByWwn", on), Texts{"2/7 1000024b4c200000 ZNT_PORT_ENABLE"});
    EXPECT_EQ(told_by("setPortByWwn", "{'indexStr': '02:4b:4c:20:00:00', 'port': {'portStatus': false}, "
                                      "'propArray': ['portStatus']}"),
              Texts{"10/4 024b4c200000 ZNT_ETH_PORT_DISABLE"});
    EXPECT_EQ(told_by("setPortByWwn",
                      "{'indexStr': '10:00:02:4b:4c:20:00:00', 'port': {'beaconState': true}, "
                      "'propArray': ['beaconState']}",
                      0),
              Texts{})
        << "no event is known of a beacon";
    const char* stop = "{'indexStr': '20:00:02:4b:4c:20:00:00', 'enableState': false}";
    EXPECT_EQ(told_by("setAdapterState", stop), Texts{"9/4 1000024b4c200000 ZNT_IOC_DISABLE"});
    EXPECT_EQ(told_by("setAdapterState", stop, 0), Texts{});
}

TEST_F(State_Events, OfLogicalPortsAreTold)
{
    const std::string port = "'pwwn': '10:00:02:4b:4c:20:00:00', 'vfId': 0, ";
    EXPECT_EQ(told_by("createVport", ("{" + port +
                                      "'vwwn': '10:00:02:4b:4c:20:01:00', 'nwwn': '20:00:02:4b:4c:20:01:00', "
                                      "'symbolicName': 'guest'}")
                                         .c_str()),
              Texts{"3/1 1000024b4c200000 ZNT_LPORT_CREATE"});
    EXPECT_EQ(told_by("deleteVport", ("{" + port + "'vportArray': ['10:00:02:4b:4c:20:01:00']}").c_str()),
              Texts{"3/2 1000024b4c200000 ZNT_LPORT_DELETE"});
}

TEST_F(State_Events, OfAuthenticationAreTold)
{
    const auto request = [](const char* enabled) {
        return std::string("{'pPortWwn': '10:00:02:4b:4c:20:00:00', 'portAuth': {'enabled': ") + enabled +
               "}}";
    };
    EXPECT_EQ(told_by("setPortAuthentication", request("true").c_str()),
              Texts{"8/1 1000024b4c200000 ZNT_AUTH_ENABLE"});
    EXPECT_EQ(told_by("setPortAuthentication", request("true").c_str(), 0), Texts{});
    EXPECT_EQ(told_by("setPortAuthentication", request("false").c_str()),
              Texts{"8/2 1000024b4c200000 ZNT_AUTH_DISABLE"});
}

TEST_F(State_Events, OfFirmwareAreToldWhenItIsWritten)
{
    const Temp_Folder folder;
    folder.write("image", "firmware-version=9.9.9.9\n");
    const auto request = [&](const char* file) {
        return "{'indexStr': '20:00:02:4b:4c:20:00:00', 'file': '" + folder.path(file) + "'}";
    };
    EXPECT_EQ(told_by("adapterUpdateFlash", request("image").c_str()),
              Texts{"8/4 1000024b4c200000 ZNT_FLASH_UPDATE"});
    EXPECT_EQ(told_by("adapterUpdateFlash", request("none").c_str(), 0), Texts{});
}

} // namespace
} // namespace KPRV::simulator

// Alerts where memory fails: on the library's thread, which makes them, on the module's own, which delivers
// them, and while a subscription begins and ends.
#include "tests/faults/Failing_Allocator.h"
#include "tests/faults/Fault_Fixture.h"
#include "tests/support/Eventually.h"
#include "tests/support/In_Child.h"

#include <condition_variable>
#include <dlfcn.h>
#include <mutex>

namespace KPRV::alert_memory {
namespace {

const char* const CLASS = "KALDERA_AlertIndication";

class Alert_Memory : public Fault_Fixture
{
protected:
    void SetUp() override
    {
        // Alerts stay allocated; the leak checker can tell them only while the module is mapped.
        ASSERT_TRUE(dlopen(module_under_test(), RTLD_NOW | RTLD_NODELETE));
        open("one_cna.json");
        server->set_sink([this](const std::string&, const broker::Instance_Value& alert) {
            const std::lock_guard lock(_mutex);
            _came.push_back(alert.property("EventID")->as_text());
            if (_on_delivery)
                _on_delivery(_came.back());
            _arrived.notify_all();
            return CMPI_RC_OK;
        });
        watch_library("libkldrprovider_Module", true);
        ASSERT_EQ(CMPI_RC_OK, server->activate_filter(CLASS, "root/kaldera"));
    }
    void TearDown() override
    {
        EXPECT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
        EXPECT_EQ(CMPI_RC_OK, server->deactivate_filter(CLASS, "root/kaldera"));
        Fault_Fixture::TearDown();
    }

    /// An event of two alerts that both bear its name. False if the library got an exception back.
    bool send(const std::string& name)
    {
        const std::string text =
            R"({"eventSeverity": 2, "eventCategory": 2, "eventId": 11, "portIndexString": "10000024b4c200000",
                "eventIdValue": "ZNT_)" +
            name + "\"}";
        try {
            EXPECT_TRUE(simulator.event(text));
            return true;
        } catch (const std::exception&) {
            return false;
        }
    }
    bool wait_for(const std::string& name, long count)
    {
        std::unique_lock lock(_mutex);
        return _arrived.wait_for(
            lock, PATIENCE, [&] { return std::count(_came.begin(), _came.end(), "ZNT_" + name) >= count; });
    }
    long number_of(const std::string& name)
    {
        const std::lock_guard lock(_mutex);
        return std::count(_came.begin(), _came.end(), "ZNT_" + name);
    }
    void on_delivery(std::function<void(const std::string&)> what)
    {
        const std::lock_guard lock(_mutex);
        _on_delivery = std::move(what);
    }

private:
    std::mutex _mutex;
    std::condition_variable _arrived;
    std::vector<std::string> _came;
    std::function<void(const std::string&)> _on_delivery;
};

using First_Subscription = Fault_Fixture;

// It makes the catalogue known, once and for all: before any other test that subscribes, and in a process of
// its own.
TEST_F(First_Subscription, ThatDoesNotComeAboutLeavesNoCallback)
{
    ASSERT_EQ(nullptr, dlopen(KLDR_MODULE, RTLD_NOW | RTLD_NOLOAD));
    in_child([&] {
        open("one_cna.json");
        watch_library("libkldrprovider_Module", true);
        ASSERT_EQ(CMPI_RC_OK, server->activate_filter(CLASS, "root/kaldera"));
        unsigned long nth = 0;
        CMPIrc rc = CMPI_RC_ERR_FAILED;
        while (rc != CMPI_RC_OK) {
            fail_allocation(++nth);
            rc = server->enable_indications(CLASS);
            mend_memory();
            EXPECT_EQ(rc == CMPI_RC_OK, simulator.status()["eventCallback"].asBool()) << nth;
            EXPECT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
            server->violations().clear();
        }
        EXPECT_LT(100u, nth) << "each text is an allocation at least";
    });
}

// What fails goes back to the library, and the next event is whole.
TEST_F(Alert_Memory, OfTheLibrarysThread)
{
    ASSERT_EQ(CMPI_RC_OK, server->enable_indications(CLASS));
    fail_allocation(~0ul);
    ASSERT_TRUE(send("FIRST"));
    const unsigned long count = mend_memory();
    ASSERT_TRUE(wait_for("FIRST", 2));
    ASSERT_LT(20u, count);
    unsigned thrown = 0;
    for (const bool once : {false, true})
        for (unsigned long nth = 1; nth <= count; nth++) {
            SCOPED_TRACE("allocation " + std::to_string(nth) + " of " + std::to_string(count));
            const std::string number = std::to_string(nth) + (once ? "_ONCE" : "_ON");
            fail_allocation(nth, once);
            // An event that the JSON library has no room for reads as none.
            thrown += !send("POOR_" + number);
            mend_memory();
            EXPECT_TRUE(send("RICH_" + number));
        }
    EXPECT_LT(count, thrown) << "most are, in both modes";
    for (const char* mode : {"_ON", "_ONCE"})
        for (unsigned long nth = 1; nth <= count; nth++) {
            const std::string number = std::to_string(nth) + mode;
            EXPECT_TRUE(wait_for("RICH_" + number, 2)) << number;
            // The standard alert goes into the queue before the other one is finished, and a line that fails
            // costs none of them.
            EXPECT_GE(logs() ? 2 : 1, number_of("POOR_" + number)) << number;
        }
}

// The failing alert is lost, and the thread goes on.
TEST_F(Alert_Memory, OfTheDeliveryThread)
{
    ASSERT_EQ(CMPI_RC_OK, server->enable_indications(CLASS));
    unsigned long nth = ~0ul, count = 0;
    // On the delivery thread: what follows on the first alert of an event, up to the second.
    on_delivery([&, is_first = true](const std::string& name) mutable {
        const unsigned long seen = mend_memory();
        if (name == "ZNT_MEASURED" && !is_first)
            count = seen;
        if (is_first && name != "ZNT_RICH")
            fail_allocation(nth, true);
        is_first = name == "ZNT_RICH" || !is_first;
    });
    ASSERT_TRUE(send("MEASURED"));
    ASSERT_TRUE(wait_for("MEASURED", 2));
    ASSERT_LT(10u, count);
    long lost = 0;
    for (nth = 1; nth <= count; nth++) {
        SCOPED_TRACE("allocation " + std::to_string(nth) + " of " + std::to_string(count));
        const std::string name = "POOR_" + std::to_string(nth);
        ASSERT_TRUE(send(name));
        ASSERT_TRUE(send("RICH"));
        ASSERT_TRUE(wait_for("RICH", 2 * static_cast<long>(nth)));
        lost += 2 - number_of(name);
    }
    if (logs()) {
        EXPECT_GT(static_cast<long>(count), lost) << "lines are lost, too";
        EXPECT_LT(0, lost);
    } else {
        EXPECT_EQ(static_cast<long>(count), lost);
    }
    EXPECT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
    expect_nothing_left();
    on_delivery({});
}

// A subscription that does not come about leaves no callback with the library, and the next one is whole.
TEST_F(Alert_Memory, OfTheBeginningAndTheEndOfASubscription)
{
    fail_allocation(~0ul);
    ASSERT_EQ(CMPI_RC_OK, server->enable_indications(CLASS));
    const unsigned long of_enabling = mend_memory();
    fail_allocation(~0ul);
    ASSERT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
    const unsigned long of_disabling = mend_memory();
    ASSERT_LE(5u, of_enabling);
    for (const bool once : {false, true})
        for (unsigned long nth = 1; nth <= of_enabling + of_disabling; nth++) {
            SCOPED_TRACE("allocation " + std::to_string(nth) + " of " + std::to_string(of_enabling) +
                         " and " + std::to_string(of_disabling) + (once ? ", once" : ""));
            const std::string name = std::to_string(nth) + (once ? "_ONCE" : "_ON");
            if (nth <= of_enabling)
                fail_allocation(nth, once);
            const CMPIrc rc = server->enable_indications(CLASS);
            mend_memory();
            EXPECT_EQ(rc == CMPI_RC_OK, simulator.status()["eventCallback"].asBool());
            if (nth > of_enabling)
                fail_allocation(nth - of_enabling, once);
            server->disable_indications(CLASS);
            mend_memory();
            EXPECT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
            EXPECT_FALSE(simulator.status()["eventCallback"].asBool());
            expect_nothing_left();
            ASSERT_EQ(CMPI_RC_OK, server->enable_indications(CLASS));
            ASSERT_TRUE(send(name));
            ASSERT_TRUE(wait_for(name, 2));
            ASSERT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
            expect_nothing_left();
        }
}

} // namespace
} // namespace KPRV::alert_memory

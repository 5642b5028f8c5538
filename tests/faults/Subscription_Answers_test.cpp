// Bad answers of the adapter library while indications are enabled or disabled; each in a process of its own,
// since alerts stay allocated.
#include "broker/Subscription.h"
#include "tests/faults/Sweep_Fixture.h"
#include "tests/support/Eventually.h"
#include "tests/support/In_Child.h"

#include <condition_variable>
#include <mutex>

namespace KPRV::subscription_answers {
namespace {

struct Way
{
    const char* entry_point;
    Answer_Kind answers;
    const char* operation;
};

constexpr Way ways[] = {
#define SUBSCRIBED(entry_point, answers, operation) {#entry_point, answers, operation},
#include "tests/faults/Ways_In.def"
};

class Subscription_Answers : public Sweep_Fixture, public testing::TestWithParam<Way>
{
protected:
    static constexpr const char* CLASS = "KALDERA_AlertIndication";

    bool is_of(const char* operation) const { return GetParam().operation == std::string(operation); }

    /// Enables, with the fault while that is done, and disables, with the fault while that is.
    CMPIrc enable(const Bad_Answer* bad)
    {
        if (bad && is_of("enable"))
            simulator.add_fault(bad->fault(GetParam().entry_point));
        const CMPIrc rc = server->enable_indications(CLASS);
        simulator.clear_faults();
        return rc;
    }
    CMPIrc disable(const Bad_Answer* bad)
    {
        if (bad && is_of("disable"))
            simulator.add_fault(bad->fault(GetParam().entry_point));
        const CMPIrc rc = server->disable_indications(CLASS);
        simulator.clear_faults();
        return rc;
    }
    bool event_arrives()
    {
        std::unique_lock lock(mutex);
        came = 0;
        EXPECT_TRUE(simulator.event(
            R"({"eventSeverity": 2, "eventCategory": 2, "eventId": 11, "portIndexString": "1000024b4ccc0000"})"));
        return arrived.wait_for(lock, PATIENCE, [&] { return came >= 2; });
    }
    void live_through(const Bad_Answer& bad)
    {
        const bool fails = is_of("enable") && bad.is_failure();
        EXPECT_EQ(fails ? CMPI_RC_ERR_FAILED : CMPI_RC_OK, enable(&bad));
        EXPECT_TRUE(was_called(GetParam().entry_point) || is_of("disable"));
        EXPECT_EQ(!fails, simulator.status()["eventCallback"].asBool());
        // The simulator has no events for one whose registration a fault has answered.
        if (simulator.status()["wantsEvents"].asBool() && !fails) {
            EXPECT_TRUE(event_arrives());
        }
        EXPECT_EQ(CMPI_RC_OK, disable(&bad));
        EXPECT_TRUE(was_called(GetParam().entry_point));
        expect_nothing_left();
    }

    std::mutex mutex;
    std::condition_variable arrived;
    unsigned came = 0;
};

TEST_P(Subscription_Answers, FailTheSubscriptionAtMostAndTheNextOneStands)
{
    in_child([&] {
        open_host();
        server->set_sink([&](const std::string&, const broker::Instance_Value&) {
            const std::lock_guard lock(mutex);
            ++came;
            arrived.notify_all();
            return CMPI_RC_OK;
        });
        ASSERT_EQ(CMPI_RC_OK, server->activate_filter(CLASS, "root/kaldera"));
        const std::vector<std::string> ports = lasting_texts(server->enumerate_instances("KALDERA_FCPort"));
        for (const Bad_Answer& bad : bad_answers_of(GetParam().answers)) {
            SCOPED_TRACE(bad.name);
            live_through(bad);
            EXPECT_EQ(ports, lasting_texts(server->enumerate_instances("KALDERA_FCPort")));
            elsewhere([&] {
                EXPECT_EQ(CMPI_RC_OK, enable(nullptr));
                EXPECT_TRUE(event_arrives());
                EXPECT_EQ(CMPI_RC_OK, disable(nullptr));
                return 0;
            });
            EXPECT_FALSE(simulator.status()["eventCallback"].asBool());
            expect_nothing_left();
        }
        EXPECT_EQ(CMPI_RC_OK, server->deactivate_filter(CLASS, "root/kaldera"));
        close_host();
    });
}

INSTANTIATE_TEST_SUITE_P(Way, Subscription_Answers, testing::ValuesIn(ways), [](const auto& row) {
    return std::string(row.param.operation) + "_" + row.param.entry_point;
});

} // namespace
} // namespace KPRV::subscription_answers

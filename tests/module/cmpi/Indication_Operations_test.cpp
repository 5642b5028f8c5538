#include "module/runtime/dispatch/Thread.h"
#include "module/runtime/system/Time.h"
#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

#include <future>

using namespace KPRV;

namespace {

struct Delivery_Worker
{
    Script::Deliver deliver;
    Thread thread;
    /// What it waits for before it delivers, if anything.
    std::future<void> start;

    static void* run(void* argument)
    {
        auto* const self = static_cast<Delivery_Worker*>(argument);
        if (self->start.valid())
            self->start.wait();
        self->deliver(make_named("from a worker"));
        return nullptr;
    }
};

class Indication_Operations : public testing::Test
{
protected:
    Indication_Operations()
    {
        provider.factory('N');
        script.calls.clear();
        script.enable_indications = [this](const Script::Deliver& x) {
            deliver = x;
            return 0;
        };
    }
    ~Indication_Operations() override
    {
        if (provider.adapter()->indications_enabled)
            disable();
        provider.cleanup('N');
    }

    CMPIIndicationMI* mi() { return &provider.data().indication_mi; }

    CMPIrc activate(const char* name_space)
    {
        return filter(name_space, &CMPIIndicationMIFT::activateFilter);
    }
    CMPIrc deactivate(const char* name_space)
    {
        return filter(name_space, &CMPIIndicationMIFT::deActivateFilter);
    }
    CMPIrc enable()
    {
        broker::Mi_Frame frame(server.broker, {});
        return mi()->ft->enableIndications(mi(), frame.context()).rc;
    }
    CMPIrc disable()
    {
        broker::Mi_Frame frame(server.broker, {});
        return mi()->ft->disableIndications(mi(), frame.context()).rc;
    }

    /// "name space count" of each entry.
    Texts name_spaces()
    {
        Texts texts;
        for (const Name_Space_Entry& entry : provider.adapter()->name_spaces)
            texts.push_back(std::string(entry.name_space.c_str()) + " " + std::to_string(entry.count));
        return texts;
    }
    /// Sends an indication from a thread of the provider's own, which has a context.
    void deliver_on_worker(const char* name)
    {
        broker::Mi_Frame frame(server.broker, {});
        const Context_Scope context(server.broker.cmpi(), frame.context(), provider.adapter());
        deliver(make_named(name));
    }
    Texts delivered_to()
    {
        Texts texts;
        for (const auto& [name_space, indication] : server.delivered)
            texts.push_back(name_space);
        return texts;
    }

    void expect_that_a_delivery_waits_for_an_operation();

    Test_Server server;
    Served_Provider provider{server, alert_registration};
    Script::Deliver deliver;

private:
    template <class Slot>
    CMPIrc filter(const char* name_space, Slot slot)
    {
        broker::Mi_Frame frame(server.broker, {});
        const broker::Argument<broker::Path_Object> path(
            *server.core, broker::Path_Value{"", name_space, "Sample_Element", {}});
        // Servers give no class name, and flags that say nothing.
        return (mi()->ft->*slot)(mi(), frame.context(), nullptr, nullptr, path.cmpi(), 1).rc;
    }
};

} // namespace

TEST_F(Indication_Operations, FiltersAreCountedByNameSpace)
{
    activate("root/one");
    activate("root/two");
    activate("root/one");
    EXPECT_EQ(name_spaces(), (Texts{"root/one 2", "root/two 1"}));
    deactivate("root/one");
    EXPECT_EQ(name_spaces(), (Texts{"root/one 1", "root/two 1"}));
    deactivate("root/one");
    EXPECT_EQ(name_spaces(), Texts{"root/two 1"});
    activate("root/one");
    EXPECT_EQ(name_spaces(), (Texts{"root/two 1", "root/one 1"}));
}

TEST_F(Indication_Operations, NamesOfNameSpacesAreComparedExactly)
{
    activate("root/one");
    activate("ROOT/one");
    EXPECT_EQ(name_spaces(), (Texts{"root/one 1", "ROOT/one 1"}));
}

TEST_F(Indication_Operations, AnUnknownNameSpaceIsIgnored)
{
    EXPECT_EQ(deactivate("root/one"), CMPI_RC_OK);
    activate("root/one");
    EXPECT_EQ(deactivate("root/two"), CMPI_RC_OK);
    EXPECT_EQ(name_spaces(), Texts{"root/one 1"});
}

TEST_F(Indication_Operations, AnAbsentNameSpaceIsEmpty)
{
    server.core->calls.fail("CMGetNameSpace", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(activate("root/one"), CMPI_RC_OK);
    EXPECT_EQ(name_spaces(), Texts{" 1"});
}

TEST_F(Indication_Operations, AuthorizeAndPollAreAlwaysFine)
{
    Log_Capture capture;
    broker::Mi_Frame frame(server.broker, {});
    // They neither lock nor look at their arguments.
    EXPECT_EQ(mi()->ft->authorizeFilter(mi(), frame.context(), nullptr, nullptr, nullptr, nullptr).rc,
              CMPI_RC_OK);
    EXPECT_EQ(mi()->ft->mustPoll(mi(), frame.context(), nullptr, nullptr, nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(capture.said(),
              (Texts{"DBG enter: authorizeFilter()", "DBG return: authorizeFilter(): CMPI_RC_OK",
                     "DBG enter: mustPoll()", "DBG return: mustPoll(): CMPI_RC_OK"}));
}

TEST_F(Indication_Operations, FiltersHaveNoContext)
{
    Thread_Context* seen = reinterpret_cast<Thread_Context*>(this);
    server.core->calls.record(true);
    activate("root/one");
    seen = Thread_Context::top();
    EXPECT_EQ(seen, nullptr);
    EXPECT_EQ(server.calls(), Texts{"CMGetNameSpace"});
}

TEST_F(Indication_Operations, EnablingCallsTheProviderOnce)
{
    EXPECT_EQ(enable(), CMPI_RC_OK);
    EXPECT_TRUE(provider.adapter()->indications_enabled);
    EXPECT_EQ(enable(), CMPI_RC_OK);
    EXPECT_EQ(script.calls, Texts{"enable_indications"});
    EXPECT_EQ(disable(), CMPI_RC_OK);
    EXPECT_FALSE(provider.adapter()->indications_enabled);
    EXPECT_EQ(disable(), CMPI_RC_OK);
    EXPECT_EQ(script.calls, (Texts{"enable_indications", "disable_indications"}));
}

TEST_F(Indication_Operations, DisablingWithoutEnablingDoesNotCallTheProvider)
{
    Log_Capture capture;
    EXPECT_EQ(disable(), CMPI_RC_OK);
    EXPECT_TRUE(script.calls.empty());
    EXPECT_EQ(capture.said(), Texts{"DBG enter: disableIndications()"}) << "no trace of the return";
}

TEST_F(Indication_Operations, AFailedEnablingStaysEnabled)
{
    script.enable_indications = [](const Script::Deliver&) { return 140; };
    EXPECT_EQ(enable(), CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(provider.adapter()->indications_enabled);
    EXPECT_EQ(enable(), CMPI_RC_OK);
    EXPECT_EQ(script.calls.size(), 1u);
    disable();
    EXPECT_EQ(enable(), CMPI_RC_ERR_FAILED);
}

TEST_F(Indication_Operations, StatusesOutsideTheTableAreFine)
{
    script.enable_indications = [](const Script::Deliver&) { return 141; };
    EXPECT_EQ(enable(), CMPI_RC_OK);
    script.disable_indications = [] { return 150; };
    EXPECT_EQ(disable(), CMPI_RC_ERR_FAILED);
    EXPECT_FALSE(provider.adapter()->indications_enabled) << "whatever the status";
    enable();
    script.disable_indications = [] { return 151; };
    EXPECT_EQ(disable(), CMPI_RC_OK);
}

TEST_F(Indication_Operations, AnIndicationGoesOnceIntoEachNameSpace)
{
    enable();
    activate("root/one");
    activate("root/two");
    activate("root/two");
    server.core->calls.record(true);
    deliver_on_worker("alert");
    EXPECT_EQ(delivered_to(), (Texts{"root/one", "root/two"}));
    EXPECT_EQ(server.delivered[1].second.path.name_space, "root/two");
    EXPECT_EQ(text_of_key(server.delivered[0].second.path, "Name"), "alert");
    EXPECT_EQ(server.core->calls.calls("CBDeliverIndication"),
              (Texts{"CBDeliverIndication root/one", "CBDeliverIndication root/two"}));
}

TEST_F(Indication_Operations, ADeliveryLeavesNothingBehind)
{
    // Servers free what is made on an attached thread only when the thread ends.
    enable();
    activate("root/one");
    activate("root/two");
    broker::Mi_Frame frame(server.broker, {});
    const Context_Scope context(server.broker.cmpi(), frame.context(), provider.adapter());
    const size_t before = server.core->ledger.live();
    for (int i = 0; i < 100; i++) {
        deliver(make_named("alert"));
        ASSERT_EQ(server.core->ledger.live(), before) << i;
    }
    EXPECT_EQ(server.delivered.size(), 200u);
}

TEST_F(Indication_Operations, AWorkerPassesAnOperationThatWaitsForItsEnd)
{
    Delivery_Worker worker;
    std::promise<void> stopping;
    script.enable_indications = [&](const Script::Deliver& x) {
        worker.deliver = x;
        worker.start = stopping.get_future();
        return Thread::create_joinable(worker.thread, Delivery_Worker::run, &worker);
    };
    script.disable_indications = [&] {
        // From here on the worker needs the adapter, which this operation holds until the worker has ended.
        stopping.set_value();
        void* result;
        return Thread::join(worker.thread, result);
    };
    activate("root/one");
    enable();
    EXPECT_EQ(disable(), CMPI_RC_OK);
    EXPECT_EQ(delivered_to(), Texts{"root/one"});
    EXPECT_EQ(provider.adapter()->adapter_mutex.try_lock(), 0);
    provider.adapter()->adapter_mutex.unlock();
}

/// Enables with a worker that delivers while an operation holds the adapter, and disables.
void Indication_Operations::expect_that_a_delivery_waits_for_an_operation()
{
    Delivery_Worker worker;
    std::promise<void> go;
    script.enable_indications = [&](const Script::Deliver& x) {
        worker.deliver = x;
        worker.start = go.get_future();
        return Thread::create_joinable(worker.thread, Delivery_Worker::run, &worker);
    };
    script.disable_indications = [&] {
        void* result;
        return Thread::join(worker.thread, result);
    };
    activate("root/one");
    enable();
    {
        const Auto_Mutex operation(provider.adapter()->adapter_mutex);
        go.set_value();
        Time::sleep(20 * Time::MSEC);
        EXPECT_TRUE(server.delivered.empty());
    }
    disable();
    EXPECT_EQ(delivered_to(), Texts{"root/one"});
}

TEST_F(Indication_Operations, ADeliveryWaitsForAnyOtherOperation)
{
    expect_that_a_delivery_waits_for_an_operation();
}

TEST_F(Indication_Operations, ADeliveryWaitsAlsoAfterADisabling)
{
    enable();
    disable();
    expect_that_a_delivery_waits_for_an_operation();
}

TEST_F(Indication_Operations, ADeliveryWaitsAlsoAfterADisablingThatThrew)
{
    script.disable_indications = []() -> int { throw std::runtime_error("disable"); };
    enable();
    EXPECT_THROW(disable(), std::runtime_error);
    EXPECT_FALSE(provider.adapter()->is_disabling);
    script.disable_indications = {};
    disable();
    expect_that_a_delivery_waits_for_an_operation();
}

TEST_F(Indication_Operations, WithoutFiltersAnIndicationIsDropped)
{
    enable();
    server.core->calls.record(true);
    EXPECT_TRUE(deliver(make_named("alert"))) << "not even a context is needed";
    EXPECT_TRUE(server.calls().empty());
}

TEST_F(Indication_Operations, TheEndMarkIsNothingToDeliver)
{
    enable();
    activate("root/one");
    EXPECT_FALSE(deliver(nullptr));
    EXPECT_TRUE(server.delivered.empty());
}

TEST_F(Indication_Operations, AFailedConversionSkipsOneNameSpace)
{
    enable();
    activate("root/one");
    activate("root/two");
    server.core->calls.fail("CMNewInstance", 1, CMPI_RC_ERR_FAILED);
    deliver_on_worker("alert");
    EXPECT_EQ(delivered_to(), Texts{"root/two"});
}

TEST_F(Indication_Operations, TheCodeOfADeliveryIsNotLookedAt)
{
    enable();
    activate("root/one");
    activate("root/two");
    server.deliver_rc = CMPI_RC_ERR_FAILED;
    deliver_on_worker("alert");
    EXPECT_EQ(server.delivered.size(), 2u);
}

TEST_F(Indication_Operations, OperationsDoNotWaitForADeliveryThatIsInTheServer)
{
    enable();
    activate("root/one");
    activate("root/two");
    std::future<CMPIrc> deleted;
    server.on_deliver = [&] {
        // A server that deletes a subscription under a lock which it wants for the delivery too.
        if (!deleted.valid())
            deleted = std::async(std::launch::async, [this] { return deactivate("root/two"); });
        EXPECT_EQ(deleted.wait_for(std::chrono::seconds(30)), std::future_status::ready);
    };
    deliver_on_worker("alert");
    EXPECT_EQ(deleted.get(), CMPI_RC_OK);
    EXPECT_EQ(delivered_to(), Texts{"root/one"});
    EXPECT_EQ(name_spaces(), Texts{"root/one 1"});
}

TEST_F(Indication_Operations, ANameSpaceThatGoesWhileItIsServedTakesNoneOfTheOthersAlong)
{
    enable();
    for (const char* name_space : {"root/one", "root/two", "root/three"})
        activate(name_space);
    server.on_deliver = [&] {
        if (server.delivered.size() == 1)
            std::async(std::launch::async, [this] { deactivate("root/one"); }).wait();
    };
    deliver_on_worker("alert");
    EXPECT_EQ(delivered_to(), (Texts{"root/one", "root/two", "root/three"}));
}

TEST_F(Indication_Operations, ANameSpaceThatComesBackDuringADeliveryIsNotServedTwice)
{
    enable();
    activate("root/one");
    activate("root/two");
    server.on_deliver = [&] {
        deactivate("root/one");
        activate("root/one");
    };
    deliver_on_worker("alert");
    EXPECT_EQ(delivered_to(), (Texts{"root/one", "root/two"}));
}

TEST_F(Indication_Operations, FiltersMayChangeDuringADelivery)
{
    enable();
    activate("root/one");
    activate("root/two");
    server.on_deliver = [&] { provider.adapter()->name_spaces.clear(); };
    deliver_on_worker("alert");
    EXPECT_EQ(delivered_to(), Texts{"root/one"});
}

TEST_F(Indication_Operations, AWorkerStartedInTheOperationIsAttachedToTheServer)
{
    Delivery_Worker worker;
    script.enable_indications = [&](const Script::Deliver& x) {
        worker.deliver = x;
        return Thread::create_joinable(worker.thread, Delivery_Worker::run, &worker);
    };
    activate("root/one");
    server.core->calls.record(true);
    EXPECT_EQ(enable(), CMPI_RC_OK);
    void* result;
    Thread::join(worker.thread, result);
    EXPECT_EQ(delivered_to(), Texts{"root/one"});
    const Texts calls = server.calls();
    EXPECT_EQ(calls.front(), "CBPrepareAttachThread");
    EXPECT_EQ(calls.at(1), "CBAttachThread");
    EXPECT_EQ(calls.back(), "CBDetachThread");
}

TEST_F(Indication_Operations, DeliveryFromAThreadWithoutContextIsFatal)
{
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    enable();
    activate("root/one");
    EXPECT_EXIT(
        {
            broker::Mi_Frame frame(server.broker, {});
            deliver(make_named("alert"));
        },
        testing::KilledBySignal(SIGABRT), "assert: thread_context != 0\n\n$");
}

TEST_F(Indication_Operations, AnExceptionOfTheProviderPasses)
{
    script.enable_indications = [](const Script::Deliver&) -> int { throw std::runtime_error("enable"); };
    EXPECT_THROW(enable(), std::runtime_error);
    EXPECT_EQ(Thread_Context::top(), nullptr);
    EXPECT_EQ(provider.adapter()->adapter_mutex.try_lock(), 0);
    provider.adapter()->adapter_mutex.unlock();
}

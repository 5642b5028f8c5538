#include "contracts/adapter/HbaAgentError.h"
#include "module/cmpi/cmpi_text.h"
#include "module/cmpi/entries.h"
#include "module/cmpi/exception_containment.h"
#include "tests/module/cmpi/Test_Server.h"

#include <pthread.h>

using namespace KPRV;
using broker::Result;

// Linked with the form that contains; that exceptions pass in the other one is told by the tests of each
// entry.

namespace {

class Contained_Exceptions : public testing::Test
{
protected:
    Contained_Exceptions()
    {
        server.tells_failures = true;
        provider.factory('I');
    }
    ~Contained_Exceptions() override
    {
        script = Script();
        provider.cleanup('I');
        EXPECT_EQ(provider.adapter(), nullptr);
        EXPECT_EQ(Thread_Context::top(), nullptr);
    }

    Result enumerate()
    {
        return provider.operate(class_path("Sample_Element"), [&](auto context, auto result, auto cop) {
            CMPIInstanceMI* const mi = &provider.data().instance_mi;
            return mi->ft->enumerateInstances(mi, context, result, cop, nullptr);
        });
    }
    template <class Exception>
    Result enumerate_throwing(const Exception& exception)
    {
        script.enum_instances = [&](const Instance*, const Script::Deliver& deliver) -> int {
            deliver(make_named("a"));
            throw exception;
        };
        return enumerate();
    }
    static void expect_contained(const Result& result, const std::string& message)
    {
        EXPECT_EQ(result.rc, CMPI_RC_ERR_FAILED);
        EXPECT_EQ(result.message, message);
        EXPECT_EQ(result.exception.value_or("none"), "none");
        EXPECT_EQ(result.done_count, 0u);
    }

    Test_Server server;
    Served_Provider provider{server, element_registration};
};

/// The words of a table from its first slot on.
template <class Table>
std::vector<void*> slots_of(const Table& table)
{
    const auto* const first = reinterpret_cast<void* const*>(&table.cleanup);
    return {first, reinterpret_cast<void* const*>(&table + 1)};
}

template <class Table>
void expect_all_exchanged(const Table& inside, const Table& outside)
{
    const std::vector<void*> before = slots_of(inside), after = slots_of(outside);
    for (size_t i = 0; i < before.size(); i++) {
        EXPECT_EQ(before[i] == nullptr, after[i] == nullptr) << i;
        EXPECT_TRUE(!before[i] || before[i] != after[i]) << "slot " << i << " lets exceptions pass";
    }
}

} // namespace

TEST_F(Contained_Exceptions, StandBehindEachSlotThatIsFilled)
{
    CMPI_Static_Data inside = {};
    fill_instance_operations(inside.instance_ft);
    fill_method_operations(inside.method_ft);
    fill_association_operations(inside.association_ft);
    fill_indication_operations(inside.indication_ft);
    fill_cleanup_operations(inside);
    const CMPI_Static_Data& outside = provider.data();
    expect_all_exchanged(inside.instance_ft, outside.instance_ft);
    expect_all_exchanged(inside.method_ft, outside.method_ft);
    expect_all_exchanged(inside.association_ft, outside.association_ft);
    expect_all_exchanged(inside.indication_ft, outside.indication_ft);
}

TEST_F(Contained_Exceptions, BearTheNameOfTheirEntry)
{
    CMPI_Static_Data& data = provider.data();
    for (const char kind : {'M', 'A', 'N'})
        provider.factory(kind);
    const auto expect = [&](const char* call, const std::string& entry, auto&& run) {
        server.core->calls.throw_at(call, 1);
        expect_contained(provider.operate(path_of("Sample_Element", "a"), run),
                         entry + ": " + call + " was told to throw");
        server.core->calls.mend();
    };
    const auto of_class = [&](const std::string& entry, auto&& run) { expect("CMGetClassName", entry, run); };
    CMPIInstanceMI* const instance = &data.instance_mi;
    of_class("enumerateInstanceNames", [&](auto context, auto result, auto cop) {
        return instance->ft->enumerateInstanceNames(instance, context, result, cop);
    });
    of_class("enumerateInstances", [&](auto context, auto result, auto cop) {
        return instance->ft->enumerateInstances(instance, context, result, cop, nullptr);
    });
    of_class("getInstance", [&](auto context, auto result, auto cop) {
        return instance->ft->getInstance(instance, context, result, cop, nullptr);
    });
    of_class("createInstance", [&](auto context, auto result, auto cop) {
        return instance->ft->createInstance(instance, context, result, cop, nullptr);
    });
    of_class("modifyInstance", [&](auto context, auto result, auto cop) {
        return instance->ft->modifyInstance(instance, context, result, cop, nullptr, nullptr);
    });
    of_class("deleteInstance", [&](auto context, auto result, auto cop) {
        return instance->ft->deleteInstance(instance, context, result, cop);
    });
    CMPIMethodMI* const method = &data.method_mi;
    of_class("invokeMethod(Reset)", [&](auto context, auto result, auto cop) {
        return method->ft->invokeMethod(method, context, result, cop, "Reset", nullptr, nullptr);
    });
    CMPIAssociationMI* const association = &data.association_mi;
    of_class("associators", [&](auto context, auto result, auto cop) {
        return association->ft->associators(association, context, result, cop, nullptr, nullptr, nullptr,
                                            nullptr, nullptr);
    });
    of_class("associatorNames", [&](auto context, auto result, auto cop) {
        return association->ft->associatorNames(association, context, result, cop, nullptr, nullptr, nullptr,
                                                nullptr);
    });
    of_class("references", [&](auto context, auto result, auto cop) {
        return association->ft->references(association, context, result, cop, nullptr, nullptr, nullptr);
    });
    of_class("referenceNames", [&](auto context, auto result, auto cop) {
        return association->ft->referenceNames(association, context, result, cop, nullptr, nullptr);
    });
    CMPIIndicationMI* const indication = &data.indication_mi;
    expect("CMGetNameSpace", "activateFilter", [&](auto context, auto, auto cop) {
        return indication->ft->activateFilter(indication, context, nullptr, "", cop, true);
    });
    expect("CMGetNameSpace", "deActivateFilter", [&](auto context, auto, auto cop) {
        return indication->ft->deActivateFilter(indication, context, nullptr, "", cop, true);
    });
    for (const char kind : {'M', 'A', 'N'})
        provider.cleanup(kind);
}

TEST_F(Contained_Exceptions, OfEnablingAndDisabling)
{
    Served_Provider alerts(server, alert_registration);
    alerts.factory('N');
    CMPIIndicationMI* const mi = &alerts.data().indication_mi;
    const auto enable = [&](auto context, auto, auto) { return mi->ft->enableIndications(mi, context); };
    const auto disable = [&](auto context, auto, auto) { return mi->ft->disableIndications(mi, context); };
    const broker::Path_Value path = class_path("Sample_Element");
    script.enable_indications = [](const Script::Deliver&) -> int { throw std::runtime_error("no events"); };
    script.disable_indications = []() -> int { throw std::runtime_error("no end"); };
    expect_contained(alerts.operate(path, enable), "enableIndications: no events");
    expect_contained(alerts.operate(path, disable), "disableIndications: no end");
    EXPECT_FALSE(alerts.adapter()->is_disabling);
    script.disable_indications = nullptr;
    EXPECT_EQ(alerts.operate(path, disable).rc, CMPI_RC_OK);
    alerts.cleanup('N');
}

TEST_F(Contained_Exceptions, OfACleanupLeaveTheProviderLoaded)
{
    script.unload = []() -> int { throw std::runtime_error("busy"); };
    CMPIInstanceMI* const mi = &provider.data().instance_mi;
    expect_contained(
        provider.operate(class_path("Sample_Element"),
                         [&](auto context, auto, auto) { return mi->ft->cleanup(mi, context, true); }),
        "cleanup: busy");
    EXPECT_NE(provider.adapter(), nullptr);
}

TEST_F(Contained_Exceptions, LeaveNoLockNoContextAndNoInstance)
{
    expect_contained(enumerate_throwing(std::runtime_error("broken")), "enumerateInstances: broken");
    EXPECT_EQ(Thread_Context::top(), nullptr);
    int lock = -1;
    std::thread([&] {
        lock = provider.adapter()->adapter_mutex.try_lock();
        if (lock == 0)
            provider.adapter()->adapter_mutex.unlock();
    }).join();
    EXPECT_EQ(lock, 0);
    script.enum_instances = nullptr;
    EXPECT_EQ(enumerate().rc, CMPI_RC_OK);
}

TEST_F(Contained_Exceptions, OfEveryKindHaveWords)
{
    expect_contained(enumerate_throwing(HbaAgentError{7, "busy"}), "enumerateInstances: busy");
    expect_contained(enumerate_throwing(std::bad_alloc()), "enumerateInstances: std::bad_alloc");
    expect_contained(enumerate_throwing(5), "enumerateInstances: an exception of unknown type");
    expect_contained(enumerate_throwing(std::runtime_error("%s%n 100%")), "enumerateInstances: %s%n 100%");
    expect_contained(enumerate_throwing(std::runtime_error("")), "enumerateInstances: ");
}

TEST_F(Contained_Exceptions, AreCutBehindAWholeCharacter)
{
    const std::string head = "enumerateInstances: ";
    constexpr size_t MOST = 1023;
    // The first ones of two, three and four bytes, and one of each that stands among others.
    for (const std::string character :
         {"a", "\u0080", "\u00e4", "\u0800", "\u20ac", "\U00010000", "\U0001F600"}) {
        for (size_t offset = 0; offset < character.size(); offset++) {
            std::string text(offset, '-');
            const size_t fitting = (MOST - head.size() - offset) / character.size();
            for (size_t i = 0; i < fitting; i++)
                text += character;
            const std::string expected = head + text;
            expect_contained(enumerate_throwing(std::runtime_error(text)), expected);
            expect_contained(enumerate_throwing(std::runtime_error(text + character)), expected);
        }
    }
    // What is no UTF-8 is cut where the room ends.
    const std::string endless(2 * MOST, '\x80');
    expect_contained(enumerate_throwing(std::runtime_error(endless)),
                     head + endless.substr(0, MOST - head.size()));
}

TEST_F(Contained_Exceptions, DoWithoutAMessageWhereTheServerHasNone)
{
    script.enum_instances = [](const Instance*, const Script::Deliver&) -> int { throw std::bad_alloc(); };
    server.core->calls.fail("CMNewString", 1, CMPI_RC_ERR_FAILED);
    expect_contained(enumerate(), "");
    server.core->calls.mend();
    server.core->calls.throw_at("CMNewString", 1);
    expect_contained(enumerate(), "");
}

TEST_F(Contained_Exceptions, DoNotIncludeTheEndOfAThread)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) -> int {
        deliver(make_named("a"));
        pthread_exit(&script);
    };
    // Without `operate`: it takes whatever comes for an exception.
    std::function<void()> call = [&] {
        broker::Mi_Frame frame(server.broker, {});
        const broker::Argument<broker::Path_Object> cop(*server.core, class_path("Sample_Element"), true);
        broker::Collected kept;
        const broker::Argument<broker::Result_Object> results(
            *server.core, unsigned(broker::Result_Object::INSTANCES), static_cast<broker::Receiver&>(kept));
        CMPIInstanceMI* const mi = &provider.data().instance_mi;
        mi->ft->enumerateInstances(mi, frame.context(), results.cmpi(), cop.cmpi(), nullptr);
    };
    const auto body = [](void* data) -> void* {
        (*static_cast<std::function<void()>*>(data))();
        return nullptr;
    };
    pthread_t thread;
    ASSERT_EQ(0, pthread_create(&thread, nullptr, body, &call));
    void* end = nullptr;
    pthread_join(thread, &end);
    EXPECT_EQ(end, &script) << "the thread must not come back";
    script.enum_instances = nullptr;
    EXPECT_EQ(enumerate().rc, CMPI_RC_OK) << "its lock is open";
}

TEST(Contained_Factories, TellWhatTheProviderThrew)
{
    Test_Server server;
    alignas(16) unsigned char area[STATIC_DATA_AREA] = {};
    const auto create = [&](CMPIStatus* status) {
        broker::Mi_Frame frame(server.broker, {});
        void* const mi = create_mi(area, element_registration, server.broker.cmpi(), frame.context(),
                                   "Sample_Element_Provider", 'I', status);
        if (!mi && status) {
            EXPECT_STREQ(text_of(status->msg), "Sample_Element_Provider: load");
        }
        return mi;
    };
    script.load = []() -> int { throw std::runtime_error("load"); };
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    EXPECT_EQ(create(&status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(create(nullptr), nullptr);

    script.load = nullptr;
    status = {CMPI_RC_ERR_ACCESS_DENIED, nullptr};
    auto* const mi = static_cast<CMPIInstanceMI*>(create(&status));
    ASSERT_NE(mi, nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_ACCESS_DENIED) << "left alone";
    broker::Mi_Frame frame(server.broker, {});
    EXPECT_EQ(mi->ft->cleanup(mi, frame.context(), true).rc, CMPI_RC_OK);
}

#include "module/cmpi/Operation_Scope.h"
#include "module/runtime/dispatch/cimom.h"
#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

#include <thread>

using namespace KPRV;
using broker::Result;

namespace {

class Operation_Scope_Test : public testing::Test
{
protected:
    Operation_Scope_Test() { provider.factory('I'); }
    ~Operation_Scope_Test() override
    {
        script.load = script.unload = nullptr;
        provider.cleanup('I');
    }

    Result enumerate(const char* class_name = "Sample_Element")
    {
        return provider.operate(class_path(class_name), [&](auto context, auto result, auto cop) {
            CMPIInstanceMI* const mi = &provider.data().instance_mi;
            return mi->ft->enumerateInstances(mi, context, result, cop, nullptr);
        });
    }
    Result get(const char* name)
    {
        return provider.operate(path_of("Sample_Element", name), [&](auto context, auto result, auto cop) {
            CMPIInstanceMI* const mi = &provider.data().instance_mi;
            return mi->ft->getInstance(mi, context, result, cop, nullptr);
        });
    }

    /// What another thread finds: 0 free, 16 held.
    int try_mutex()
    {
        int result = -1;
        std::thread([&] {
            Mutex& mutex = provider.adapter()->adapter_mutex;
            result = mutex.try_lock();
            if (result == 0)
                mutex.unlock();
        }).join();
        return result;
    }

    Test_Server server;
    Served_Provider provider{server, element_registration};
};

Texts trace_lines(const Log_Capture& capture)
{
    Texts texts;
    for (const Log_Capture::Line& line : capture.lines()) {
        if (line.level == "DBG")
            texts.push_back(line.text);
    }
    return texts;
}

} // namespace

TEST_F(Operation_Scope_Test, ContextAndLockAreHeldForTheCall)
{
    Thread_Context* context = nullptr;
    int in_provider = -1, in_stream = -1;
    script.enum_instances = [&](const Instance*, const Script::Deliver& deliver) {
        context = Thread_Context::top();
        in_provider = try_mutex();
        deliver(make_named("a"));
        in_stream = try_mutex();
        return 0;
    };
    EXPECT_EQ(try_mutex(), 0);
    enumerate();
    EXPECT_NE(context, nullptr);
    EXPECT_EQ(in_provider, 16);
    EXPECT_EQ(in_stream, 16);
    EXPECT_EQ(try_mutex(), 0);
    EXPECT_EQ(Thread_Context::top(), nullptr);
}

TEST_F(Operation_Scope_Test, TwoProvidersRunAtOnceAndOneDoesNot)
{
    Served_Provider other(server, port_registration);
    other.factory('I');
    EXPECT_NE(other.adapter(), provider.adapter());
    int other_mutex = -1;
    script.enum_instances = [&](const Instance*, const Script::Deliver&) {
        std::thread([&] {
            other_mutex = other.adapter()->adapter_mutex.try_lock();
            if (other_mutex == 0)
                other.adapter()->adapter_mutex.unlock();
        }).join();
        return 0;
    };
    enumerate();
    EXPECT_EQ(other_mutex, 0);
    other.cleanup('I');
}

TEST_F(Operation_Scope_Test, AnExceptionPassesAndLeavesNoLockAndNoContext)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) -> int {
        deliver(make_named("a"));
        throw std::runtime_error("provider");
    };
    const Result failed = enumerate();
    EXPECT_EQ(failed.exception, "provider");
    EXPECT_FALSE(failed.done);
    EXPECT_EQ(Thread_Context::top(), nullptr);
    EXPECT_EQ(try_mutex(), 0);
    EXPECT_EQ(server.core->violations.count(), 1u);
    server.core->violations.clear();

    script.enum_instances = nullptr;
    EXPECT_EQ(enumerate().rc, CMPI_RC_OK);
}

TEST_F(Operation_Scope_Test, AnExceptionOfTheServerPassesToo)
{
    script.enum_instances = [](const Instance*, const Script::Deliver& deliver) {
        deliver(make_named("a"));
        return 0;
    };
    for (const char* call : {"CMGetClassName", "CMGetKeyCount", "CMNewInstance", "CMSetProperty",
                             "CMReturnInstance", "CMReturnDone"}) {
        server.core->calls.throw_at(call, 1);
        EXPECT_TRUE(enumerate().exception) << call;
        EXPECT_EQ(Thread_Context::top(), nullptr) << call;
        EXPECT_EQ(try_mutex(), 0) << call;
        server.core->violations.clear();
        EXPECT_EQ(enumerate().rc, CMPI_RC_OK) << call;
    }
}

TEST_F(Operation_Scope_Test, AnUpCallMayComeBackOnTheSameThread)
{
    Thread_Context* outer = nullptr;
    Thread_Context* inner = nullptr;
    script.enum_instances = [&](const Instance*, const Script::Deliver& deliver) {
        outer = Thread_Context::top();
        const Ref<Instance> model(make_named("up"));
        const Ref<Instance> answer = cimom::get_instance(NAME_SPACE, model.ptr());
        EXPECT_TRUE(answer);
        EXPECT_EQ(Thread_Context::top(), outer) << "the inner one is popped";
        deliver(clone(answer.ptr()));
        return 0;
    };
    script.get_instance = [&](const Instance* model, Instance*& instance) {
        inner = Thread_Context::top();
        instance = clone(model);
        return 0;
    };
    server.on_up_call = [&](const broker::Request& request) {
        return get(request.path.key("Name")->as_text().c_str());
    };
    const Result result = enumerate();
    ASSERT_EQ(result.instances.size(), 1u);
    EXPECT_EQ(text_of_key(result.instances[0].path, "Name"), "up");
    EXPECT_NE(inner, nullptr);
    EXPECT_NE(inner, outer);
}

TEST_F(Operation_Scope_Test, ThreadsTakeTurns)
{
    int running = 0;
    int worst = 0;
    script.enum_instances = [&](const Instance*, const Script::Deliver& deliver) {
        worst = std::max(worst, ++running);
        deliver(make_named("a"));
        running--;
        return 0;
    };
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; i++) {
        threads.emplace_back([&] {
            for (int round = 0; round < 20; round++)
                EXPECT_EQ(enumerate().instances.size(), 1u);
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(worst, 1);
}

TEST_F(Operation_Scope_Test, TracesEntryAndReturn)
{
    Log_Capture capture;
    enumerate();
    script.enum_instances = [](const Instance*, const Script::Deliver&) { return 70; };
    enumerate();
    enumerate("Unknown");
    EXPECT_EQ(trace_lines(capture),
              (Texts{"enter: enumInstances()", "return: enumInstances(): CMPI_RC_OK",
                     "enter: enumInstances()", "return: enumInstances(): CMPI_RC_ERR_FAILED",
                     "enter: enumInstances()", "return: enumInstances(): CMPI_RC_ERR_FAILED"}));
}

TEST_F(Operation_Scope_Test, AnExceptionTracesNoReturn)
{
    script.enum_instances = [](const Instance*, const Script::Deliver&) -> int { throw 1; };
    Log_Capture capture;
    enumerate();
    EXPECT_EQ(trace_lines(capture), Texts{"enter: enumInstances()"});
    server.core->violations.clear();
}

TEST_F(Operation_Scope_Test, EachEntryHasItsTraceName)
{
    Log_Capture capture;
    CMPIInstanceMI* const mi = &provider.data().instance_mi;
    const auto run = [&](auto entry) { provider.operate(class_path("Unknown"), entry); };
    const broker::Argument<broker::Instance_Object> ci(*server.core, broker::Instance_Value{});
    run([&](auto c, auto r, auto o) { return mi->ft->enumerateInstanceNames(mi, c, r, o); });
    run([&](auto c, auto r, auto o) { return mi->ft->enumerateInstances(mi, c, r, o, nullptr); });
    run([&](auto c, auto r, auto o) { return mi->ft->getInstance(mi, c, r, o, nullptr); });
    run([&](auto c, auto r, auto o) { return mi->ft->createInstance(mi, c, r, o, ci.cmpi()); });
    run([&](auto c, auto r, auto o) { return mi->ft->modifyInstance(mi, c, r, o, ci.cmpi(), nullptr); });
    run([&](auto c, auto r, auto o) { return mi->ft->deleteInstance(mi, c, r, o); });
    run([&](auto c, auto r, auto o) { return mi->ft->execQuery(mi, c, r, o, "", ""); });
    Texts expected;
    for (const char* name : {"enumInstanceNames", "enumInstances", "getInstance", "createInstance",
                             "modifyInstance", "deleteInstance"}) {
        expected.push_back(std::string("enter: ") + name + "()");
        expected.push_back(std::string("return: ") + name + "(): CMPI_RC_ERR_FAILED");
    }
    expected.push_back("enter: execQuery()");
    expected.push_back("return: execQuery(): CMPI_RC_ERR_NOT_SUPPORTED");
    EXPECT_EQ(trace_lines(capture), expected);
}

TEST_F(Operation_Scope_Test, AContextDeletedByFailingThreadCreationLastsToTheEndOfTheFrame)
{
    script.enum_instances = [&](const Instance*, const Script::Deliver& deliver) {
        delete Thread_Context::top();
        deliver(make_named("a"));
        return 0;
    };
    EXPECT_EQ(enumerate().instances.size(), 1u);
    EXPECT_EQ(Thread_Context::top(), nullptr);
}

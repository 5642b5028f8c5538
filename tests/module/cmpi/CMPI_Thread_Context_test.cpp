#include "module/cmpi/CMPI_Thread_Context.h"
#include "module/runtime/dispatch/Thread.h"
#include "module/runtime/dispatch/cimom.h"
#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

using namespace KPRV;
using broker::Result;

namespace {

/// Up-calls from within an operation of a provider.
class CMPI_Thread_Context_Test : public testing::Test
{
protected:
    CMPI_Thread_Context_Test() { provider.factory('I'); }
    ~CMPI_Thread_Context_Test() override { provider.cleanup('I'); }

    /// Runs the body where a provider's code runs.
    template <class Body>
    void in_operation(Body body)
    {
        script.enum_instances = [&](const Instance*, const Script::Deliver&) {
            body();
            return 0;
        };
        provider.operate(class_path("Sample_Element"), [&](auto context, auto result, auto cop) {
            CMPIInstanceMI* const mi = &provider.data().instance_mi;
            return mi->ft->enumerateInstances(mi, context, result, cop, nullptr);
        });
    }
    /// Lets the server answer with instances of these names.
    void answer_with(std::vector<std::string> names, const char* class_name = "Sample_Element")
    {
        server.on_up_call = [this, names, class_name](const broker::Request& request) {
            requests.push_back(request);
            Result result;
            for (const std::string& name : names) {
                result.instances.push_back(
                    {path_of(class_name, name.c_str()), {{"Name", broker::Plain_Value::text(name)}}});
            }
            return result;
        };
    }
    void answer_with(CMPIrc rc)
    {
        server.on_up_call = [this, rc](const broker::Request& request) {
            requests.push_back(request);
            return Result{.rc = rc};
        };
    }

    Test_Server server;
    Served_Provider provider{server, element_registration};
    std::vector<broker::Request> requests;
    const Ref<Instance> model{make_named("m")};
};

} // namespace

TEST_F(CMPI_Thread_Context_Test, GetInstance)
{
    answer_with({"answer"});
    server.core->calls.record(true);
    in_operation([&] {
        server.calls();
        const Ref<Instance> instance = cimom::get_instance("root/up", model.ptr());
        ASSERT_TRUE(instance);
        EXPECT_EQ(name_of_sample(instance.ptr()), "answer");
        EXPECT_EQ(instance->__name_space, "root/up");
        EXPECT_EQ(instance->__refs, 1);
        const Texts calls = server.calls();
        EXPECT_EQ(Texts(calls.begin(), calls.begin() + 5),
                  (Texts{"CMNewObjectPath Sample_Element", "CMNewString m", "CMAddKey Name",
                         "CBGetInstance Sample_Element", "CMGetNameSpace"}));
    });
    ASSERT_EQ(requests.size(), 1u);
    EXPECT_EQ(requests[0].path.name_space, "root/up");
    EXPECT_FALSE(requests[0].properties) << "all of them";
}

TEST_F(CMPI_Thread_Context_Test, GetInstanceWithNullKeysAsksWithAKeylessPath)
{
    answer_with({"answer"});
    in_operation([&] {
        __set_null_flags(model.ptr(), true, true, 1);
        EXPECT_TRUE(cimom::get_instance("root/up", model.ptr()));
    });
    EXPECT_TRUE(requests.at(0).path.keys.empty());
}

TEST_F(CMPI_Thread_Context_Test, GetInstanceFailsQuietly)
{
    answer_with(CMPI_RC_ERR_NOT_FOUND);
    in_operation([&] {
        EXPECT_FALSE(cimom::get_instance(nullptr, model.ptr()));
        EXPECT_FALSE(cimom::get_instance("root/up", nullptr));
        EXPECT_TRUE(requests.empty());
        EXPECT_FALSE(cimom::get_instance("root/up", model.ptr()));
        EXPECT_EQ(requests.size(), 1u);
        server.core->calls.fail("CMNewObjectPath", 1, CMPI_RC_ERR_FAILED);
        EXPECT_FALSE(cimom::get_instance("root/up", model.ptr()));
        EXPECT_EQ(requests.size(), 1u);
    });
}

TEST_F(CMPI_Thread_Context_Test, EnumerationWalksTheServersInstances)
{
    answer_with({"a", "b", "c"});
    Texts names;
    in_operation([&] {
        Instance_Enumerator enumerator;
        EXPECT_EQ(cimom::enum_instances("root/up", model.ptr(), enumerator), 0);
        for (; enumerator; enumerator++)
            names.push_back(name_of_sample(enumerator().ptr()));
        EXPECT_FALSE(enumerator());
        enumerator++;
        EXPECT_FALSE(enumerator);
    });
    EXPECT_EQ(names, (Texts{"a", "b", "c"}));
    EXPECT_EQ(requests.at(0).operation, broker::Operation::ENUMERATE_INSTANCES);
    EXPECT_EQ(requests[0].path.name_space, "root/up");
}

TEST_F(CMPI_Thread_Context_Test, ElementsAreJudgedByCodeAndTypeNotByState)
{
    Test_Server odd(broker::Server_Options::pegasus_like());
    Served_Provider odd_provider(odd, element_registration);
    odd_provider.factory('I');
    odd.on_up_call = [](const broker::Request&) {
        Result result;
        result.instances.push_back(
            {path_of("Sample_Element", "a"), {{"Name", broker::Plain_Value::text("a")}}});
        return result;
    };
    size_t count = 0;
    script.enum_instances = [&](const Instance*, const Script::Deliver&) {
        Instance_Enumerator enumerator;
        cimom::enum_instances("root/up", model.ptr(), enumerator);
        for (; enumerator; enumerator++)
            count++;
        return 0;
    };
    odd_provider.operate(class_path("Sample_Element"), [&](auto context, auto result, auto cop) {
        CMPIInstanceMI* const mi = &odd_provider.data().instance_mi;
        return mi->ft->enumerateInstances(mi, context, result, cop, nullptr);
    });
    EXPECT_EQ(count, 1u);
    script.enum_instances = nullptr;
    odd_provider.cleanup('I');
}

TEST_F(CMPI_Thread_Context_Test, AFailingElementEndsTheWalk)
{
    answer_with({"a", "b", "c"});
    for (const char* call : {"CMGetNext", "CMGetObjectPath"}) {
        Texts names;
        in_operation([&] {
            server.core->calls.fail(call, 2, CMPI_RC_ERR_FAILED);
            Instance_Enumerator enumerator;
            EXPECT_EQ(cimom::enum_instances("root/up", model.ptr(), enumerator), 0);
            for (; enumerator; enumerator++)
                names.push_back(name_of_sample(enumerator().ptr()));
        });
        EXPECT_EQ(names, Texts{"a"}) << call;
    }
}

TEST_F(CMPI_Thread_Context_Test, ElementsThatAreNoInstancesEndTheWalk)
{
    server.on_up_call = [](const broker::Request&) {
        Result result;
        result.paths.push_back(path_of("Sample_Element", "a"));
        return result;
    };
    in_operation([&] {
        Instance_Enumerator enumerator;
        EXPECT_EQ(cimom::enum_instances("root/up", model.ptr(), enumerator), 0);
        EXPECT_FALSE(enumerator);
    });
}

TEST_F(CMPI_Thread_Context_Test, AnEnumerationThatCannotBeMade)
{
    answer_with(CMPI_RC_ERR_INVALID_NAMESPACE);
    in_operation([&] {
        Instance_Enumerator enumerator;
        EXPECT_EQ(cimom::enum_instances(nullptr, model.ptr(), enumerator), -1);
        EXPECT_EQ(cimom::enum_instances("root/up", nullptr, enumerator), -1);
        EXPECT_EQ(cimom::enum_instances("root/up", model.ptr(), enumerator), -1);
        EXPECT_FALSE(enumerator);
    });
    EXPECT_EQ(requests.size(), 1u);
}

TEST_F(CMPI_Thread_Context_Test, ChangesGoToTheServer)
{
    server.on_up_call = [this](const broker::Request& request) {
        requests.push_back(request);
        Result result;
        if (request.operation == broker::Operation::CREATE_INSTANCE)
            result.paths.push_back(request.path);
        return result;
    };
    in_operation([&] {
        EXPECT_EQ(cimom::create_instance("root/up", model.ptr()), 0);
        EXPECT_EQ(cimom::modify_instance("root/up", model.ptr()), 0);
        EXPECT_EQ(cimom::delete_instance("root/up", model.ptr()), 0);
    });
    ASSERT_EQ(requests.size(), 3u);
    EXPECT_EQ(requests[0].operation, broker::Operation::CREATE_INSTANCE);
    EXPECT_EQ(*requests[0].instance.property("Name"), broker::Plain_Value::text("m"));
    EXPECT_EQ(requests[1].operation, broker::Operation::MODIFY_INSTANCE);
    EXPECT_FALSE(requests[1].properties);
    EXPECT_EQ(*requests[1].instance.property("Name"), broker::Plain_Value::text("m"));
    EXPECT_EQ(requests[2].operation, broker::Operation::DELETE_INSTANCE);
    EXPECT_EQ(text_of_key(requests[2].path, "Name"), "m");
}

TEST_F(CMPI_Thread_Context_Test, FailingChangesAreMinusOne)
{
    answer_with(CMPI_RC_ERR_NOT_SUPPORTED);
    in_operation([&] {
        const auto all_fail = [&](const char* name_space, const Instance* instance) {
            EXPECT_EQ(cimom::create_instance(name_space, instance), -1);
            EXPECT_EQ(cimom::modify_instance(name_space, instance), -1);
            EXPECT_EQ(cimom::delete_instance(name_space, instance), -1);
        };
        all_fail("root/up", model.ptr());
        EXPECT_EQ(requests.size(), 3u);
        all_fail(nullptr, model.ptr());
        all_fail("root/up", nullptr);
        for (int i = 0; i < 3; i++)
            server.core->calls.fail("CMNewObjectPath", 1, CMPI_RC_ERR_FAILED);
        all_fail("root/up", model.ptr());
        for (int i = 0; i < 2; i++)
            server.core->calls.fail("CMNewInstance", 1, CMPI_RC_ERR_FAILED);
        EXPECT_EQ(cimom::create_instance("root/up", model.ptr()), -1);
        EXPECT_EQ(cimom::modify_instance("root/up", model.ptr()), -1);
        EXPECT_EQ(requests.size(), 3u);
    });
}

TEST_F(CMPI_Thread_Context_Test, UsernameIsThePrincipal)
{
    server.context_entries = {{CMPIPrincipal, broker::Plain_Value::text("root")}};
    String name;
    in_operation([&] { EXPECT_TRUE(cimom::get_username(name)); });
    EXPECT_EQ(name, "root");
}

TEST_F(CMPI_Thread_Context_Test, UsernameWithoutAPrincipal)
{
    Log_Capture capture;
    String name("kept");
    in_operation([&] { EXPECT_FALSE(cimom::get_username(name)); });
    EXPECT_EQ(name, "kept");
    EXPECT_EQ(capture.said("ERR"), Texts{"ERR username not OK cmpirc=12"});
}

TEST_F(CMPI_Thread_Context_Test, UsernameWithoutAContextOfTheServer)
{
    Log_Capture capture;
    String name;
    const Context_Scope scope(server.broker.cmpi(), nullptr, provider.adapter());
    EXPECT_FALSE(cimom::get_username(name));
    EXPECT_EQ(capture.said("ERR"), Texts{});
}

TEST_F(CMPI_Thread_Context_Test, APrincipalWithoutTextIsAnEmptyName)
{
    Test_Server odd(broker::Server_Options::sfcb_like());
    broker::Mi_Frame frame(odd.broker, {{CMPIPrincipal, broker::Plain_Value::text("")}});
    const Context_Scope scope(odd.broker.cmpi(), frame.context(), provider.adapter());
    String name("old");
    EXPECT_TRUE(cimom::get_username(name));
    EXPECT_EQ(name, "");
}

TEST_F(CMPI_Thread_Context_Test, AllowUnloadIsKeptInTheAdapter)
{
    in_operation([&] {
        cimom::allow_unload(false);
        EXPECT_FALSE(provider.adapter()->unload_allowed);
        cimom::allow_unload(true);
        EXPECT_TRUE(provider.adapter()->unload_allowed);
    });
}

namespace {

struct Worker
{
    Thread thread;
    Thread_Context* context = nullptr;
    bool found = false;

    static void* run(void* argument)
    {
        auto* const self = static_cast<Worker*>(argument);
        self->context = Thread_Context::top();
        const Ref<Instance> model(make_named("m"));
        self->found = bool(cimom::get_instance("root/up", model.ptr()));
        return nullptr;
    }
};

} // namespace

TEST_F(CMPI_Thread_Context_Test, AThreadHasAContextOfItsOwnAndMayCallTheServer)
{
    answer_with({"answer"});
    Worker worker;
    Thread_Context* parent = nullptr;
    server.core->calls.record(true);
    in_operation([&] {
        parent = Thread_Context::top();
        EXPECT_EQ(Thread::create_joinable(worker.thread, Worker::run, &worker), 0);
    });
    void* result;
    Thread::join(worker.thread, result);
    EXPECT_NE(worker.context, nullptr);
    EXPECT_NE(worker.context, parent);
    EXPECT_TRUE(worker.found);
    EXPECT_EQ(server.core->calls.calls("CBPrepareAttachThread").size(), 1u);
    EXPECT_EQ(server.core->calls.calls("CBAttachThread").size(), 1u);
    EXPECT_EQ(server.core->calls.calls("CBDetachThread").size(), 1u);
}

TEST_F(CMPI_Thread_Context_Test, AThreadOfAThreadWithoutContextFailsQuietly)
{
    Worker worker;
    ASSERT_EQ(Thread::create_joinable(worker.thread, Worker::run, &worker), 0);
    void* result;
    Thread::join(worker.thread, result);
    EXPECT_EQ(worker.context, nullptr);
    EXPECT_FALSE(worker.found);
}

TEST_F(CMPI_Thread_Context_Test, EveryOperationWorksWithTheContextOnTop)
{
    Test_Server upper;
    upper.on_up_call = [](const broker::Request& request) {
        Result result;
        result.instances.push_back({request.path, {{"Name", broker::Plain_Value::text("from above")}}});
        return result;
    };
    broker::Mi_Frame frame(upper.broker, {});
    CMPI_Thread_Context below(server.broker.cmpi(), nullptr, provider.adapter());
    const Context_Scope top(upper.broker.cmpi(), frame.context(), provider.adapter());
    EXPECT_EQ(name_of_sample(below.get_instance("root/up", model.ptr()).ptr()), "from above");
}

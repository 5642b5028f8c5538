#include "module/runtime/dispatch/cimom.h"
#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

using namespace KPRV;
using broker::Result;

namespace {

class Up_Call_Method : public testing::Test
{
protected:
    Up_Call_Method()
    {
        provider.factory('I');
        __set_null_flags(record.ptr(), true, true, 1);
        reset()->Force.set(true);
        server.on_up_call = [this](const broker::Request& request) {
            requests.push_back(request);
            return answer;
        };
        answer.return_value = broker::Plain_Value::unsigned_number(CMPI_uint32, 7);
    }
    ~Up_Call_Method() override { provider.cleanup('I'); }

    Sample_Element_Reset_method* reset() { return static_cast<Sample_Element_Reset_method*>(record.ptr()); }

    int invoke(const char* name_space, const Instance* instance, Instance* method)
    {
        broker::Mi_Frame frame(server.broker, {});
        const Context_Scope scope(server.broker.cmpi(), frame.context(), provider.adapter());
        return cimom::invoke_method(name_space, instance, method);
    }
    int invoke() { return invoke("root/up", element.ptr(), record.ptr()); }

    /// The words of a failing call.
    Texts words(const char* failing_call = nullptr)
    {
        if (failing_call)
            server.core->calls.fail(failing_call, 1, CMPI_RC_ERR_FAILED);
        Log_Capture capture;
        EXPECT_EQ(invoke(), -1);
        return capture.said();
    }

    Test_Server server;
    Served_Provider provider{server, element_registration};
    std::vector<broker::Request> requests;
    Result answer;
    const Ref<Instance> element{make_named("e")};
    const Ref<Instance> record{create(&Sample_Element_Reset_method::static_meta_class)};
};

} // namespace

TEST_F(Up_Call_Method, ParametersGoOutAndComeBack)
{
    reset()->Count.set(1);
    answer.out = {{"Count", broker::Plain_Value::unsigned_number(CMPI_uint32, 2)},
                  {"Message", broker::Plain_Value::text("done")},
                  {"Force", broker::Plain_Value::boolean(false)}};
    ASSERT_EQ(invoke(), 0);
    ASSERT_EQ(requests.size(), 1u);
    EXPECT_EQ(requests[0].method, "Reset");
    EXPECT_EQ(requests[0].path.name_space, "root/up");
    EXPECT_EQ(text_of_key(requests[0].path, "Name"), "e");
    ASSERT_EQ(requests[0].in.size(), 2u);
    EXPECT_EQ(*broker::find_value(requests[0].in, "Force"), broker::Plain_Value::boolean(true));
    EXPECT_EQ(*broker::find_value(requests[0].in, "Count"),
              broker::Plain_Value::unsigned_number(CMPI_uint32, 1));

    EXPECT_EQ(reset()->Count.value, 2u);
    EXPECT_EQ(reset()->Message.value, "done");
    EXPECT_EQ(reset()->return_value.value, 7u);
    EXPECT_EQ(reset()->return_value.null, 0);
    EXPECT_EQ(reset()->Force.null, 1) << "the answer has no part in it";
    EXPECT_EQ(reset()->__name_space, "root/up");
}

TEST_F(Up_Call_Method, AStaticMethodIsAskedOfTheClass)
{
    const Ref<Instance> thing(create<Thing>(false));
    const Ref<Instance> count(create(&Thing_plain_method::static_meta_class));
    ASSERT_EQ(invoke("root/up", thing.ptr(), count.ptr()), 0);
    EXPECT_EQ(requests.at(0).path.class_name, "Thing");
    EXPECT_TRUE(requests[0].path.keys.empty());
    EXPECT_EQ(static_cast<Thing_plain_method*>(count.ptr())->return_value.value, 7u);
}

TEST_F(Up_Call_Method, CallsAreMadeInOrder)
{
    server.core->calls.record(true);
    ASSERT_EQ(invoke(), 0);
    EXPECT_EQ(server.calls(), (Texts{"CMNewObjectPath Sample_Element", "CMNewString e", "CMAddKey Name",
                                     "CMNewArgs", "CMAddArg Force", "CMNewArgs",
                                     "CBInvokeMethod Sample_Element", "CMGetNameSpace", "CMGetArgCount"}));
}

TEST_F(Up_Call_Method, MissingArgumentsFail)
{
    Log_Capture capture;
    EXPECT_EQ(invoke(nullptr, element.ptr(), record.ptr()), -1);
    EXPECT_EQ(invoke("root/up", nullptr, record.ptr()), -1);
    EXPECT_EQ(invoke("root/up", element.ptr(), nullptr), -1);

    Meta_Class homeless = Sample_Element::static_meta_class;
    homeless.meta_repository = nullptr;
    const Ref<Instance> without_repository(create(&homeless, true));
    EXPECT_EQ(invoke("root/up", without_repository.ptr(), record.ptr()), -1);
    {
        const Context_Scope scope(server.broker.cmpi(), nullptr, provider.adapter());
        EXPECT_EQ(cimom::invoke_method("root/up", element.ptr(), record.ptr()), -1);
    }
    {
        broker::Mi_Frame frame(server.broker, {});
        const Context_Scope scope(nullptr, frame.context(), provider.adapter());
        EXPECT_EQ(cimom::invoke_method("root/up", element.ptr(), record.ptr()), -1);
    }
    EXPECT_EQ(capture.said(), Texts(6, "WARN failed"));
    EXPECT_TRUE(requests.empty());
}

TEST_F(Up_Call_Method, FailingStepsSayFailed)
{
    EXPECT_EQ(words("CMNewObjectPath"), Texts{"WARN failed"});
    EXPECT_EQ(words("CMNewArgs"), Texts{"WARN failed"});
    server.core->calls.fail("CMNewArgs", 2, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(words(), Texts{"WARN failed"});
    EXPECT_TRUE(requests.empty());

    answer.return_value = broker::Plain_Value::text("of another type");
    EXPECT_EQ(words(), (Texts{"WARN type mismatch: Reset.return_value", "WARN failed"}));
    answer.return_value = broker::Plain_Value();
    const Texts without = words();
    EXPECT_EQ(without.back(), "WARN failed");
}

TEST_F(Up_Call_Method, AFailingServerIsNamedByItsCode)
{
    answer.rc = CMPI_RC_ERR_METHOD_NOT_FOUND;
    EXPECT_EQ(words(), Texts{"WARN failed[17]"});
}

#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

using namespace KPRV;
using broker::Result;

namespace {

class Method_Operations : public testing::Test
{
protected:
    explicit Method_Operations(const Registration* registration = element_registration)
        : provider(server, registration)
    {
        provider.factory('M');
        script.calls.clear();
    }
    ~Method_Operations() override { provider.cleanup('M'); }

    /// The out arguments come in the result.
    Result invoke(const broker::Path_Value& path, const char* method,
                  std::vector<broker::Named_Value> in = {})
    {
        const broker::Argument<broker::Args_Object> in_args(*server.core, std::move(in));
        const broker::Argument<broker::Args_Object> out_args(*server.core);
        Result result = provider.operate(path, [&](auto context, auto rslt, auto cop) {
            CMPIMethodMI* const mi = &provider.data().method_mi;
            return mi->ft->invokeMethod(mi, context, rslt, cop, method, in_args.cmpi(), out_args.cmpi());
        });
        result.out = out_args->content;
        return result;
    }

    Test_Server server;
    Served_Provider provider;
    const broker::Path_Value a = path_of("Sample_Element", "a");
};

class Thing_Methods : public Method_Operations
{
protected:
    Thing_Methods() : Method_Operations(thing_registration) {}
};

} // namespace

TEST_F(Method_Operations, ParametersGoInAndOut)
{
    script.invoke = [](const Instance* self, Instance* method) {
        EXPECT_EQ(name_of_sample(self), "a");
        auto* const record = static_cast<Sample_Element_Reset_method*>(method);
        EXPECT_EQ(record->Force.value, true);
        EXPECT_EQ(name_of_sample(record->Target), "t");
        EXPECT_EQ(record->Target->__name_space, NAME_SPACE);
        EXPECT_EQ(record->Count.value, 5u);
        EXPECT_EQ(record->Message.null, 1) << "out only";
        EXPECT_EQ(record->return_value.null, 1);
        record->Count.set(6);
        record->Message.set("done");
        record->return_value.set(7);
        return 0;
    };
    const Result result = invoke(a, "reset",
                                 {{"Force", broker::Plain_Value::boolean(true)},
                                  {"Target", broker::Plain_Value::path(path_of("Sample_Element", "t"))},
                                  {"Count", broker::Plain_Value::unsigned_number(CMPI_uint32, 5)},
                                  {"Message", broker::Plain_Value::text("ignored: an out parameter")}});
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_EQ(result.done_count, 1u);
    EXPECT_EQ(result.return_value, broker::Plain_Value::unsigned_number(CMPI_uint32, 7));
    ASSERT_EQ(result.out.size(), 2u) << "no in parameters, no return_value";
    EXPECT_EQ(*broker::find_value(result.out, "Count"), broker::Plain_Value::unsigned_number(CMPI_uint32, 6));
    EXPECT_EQ(*broker::find_value(result.out, "Message"), broker::Plain_Value::text("done"));
}

TEST_F(Method_Operations, CallsAreMadeInOrder)
{
    script.invoke = [](const Instance*, Instance* method) {
        static_cast<Sample_Element_Reset_method*>(method)->return_value.set(0);
        return 0;
    };
    server.core->calls.record(true);
    invoke(class_path("Sample_Element"), "Reset");
    EXPECT_EQ(server.calls(),
              (Texts{"CMGetClassName", "CMGetClassName", "CMGetNameSpace", "CMGetKeyCount", "CMGetNameSpace",
                     "CMGetArgCount", "CMGetNameSpace", "CMReturnData", "CMReturnDone"}));
}

TEST_F(Method_Operations, Statuses)
{
    const struct
    {
        int status;
        int rc;
        unsigned done;
    } rows[] = {{0, 0, 1}, {130, 1, 0}, {131, 7, 0}, {132, 2, 0}, {133, 0, 1}, {-1, 0, 1}};
    for (const auto& row : rows) {
        script.invoke = [&](const Instance*, Instance* method) {
            static_cast<Sample_Element_Reset_method*>(method)->return_value.set(9);
            return row.status;
        };
        const Result result = invoke(a, "Reset");
        EXPECT_EQ(result.rc, row.rc) << row.status;
        EXPECT_EQ(result.done_count, row.done) << row.status;
        EXPECT_EQ(result.return_value.as_uint(), row.done ? 9u : 0u) << row.status;
    }
}

TEST_F(Method_Operations, ANullReturnValueIsDataOfType0)
{
    server.core->calls.record(true);
    const Result result = invoke(a, "Reset");
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_EQ(result.return_value.type, CMPI_null);
    EXPECT_EQ(server.core->calls.calls("CMReturnData").size(), 1u);
}

TEST_F(Method_Operations, RefusalsHaveTheirCodesAndTexts)
{
    Log_Capture capture;
    EXPECT_EQ(invoke(class_path("Unknown"), "Reset").rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(invoke(a, "Name").rc, CMPI_RC_ERR_METHOD_NOT_FOUND) << "a property";
    EXPECT_EQ(invoke(a, "Nothing").rc, CMPI_RC_ERR_METHOD_NOT_FOUND);
    EXPECT_TRUE(script.calls.empty());
    EXPECT_EQ(capture.said("DBG return"),
              (Texts{"DBG return: invokeMethod(): CMPI_RC_ERR_FAILED MetaClass not found",
                     "DBG return: invokeMethod(): CMPI_RC_ERR_METHOD_NOT_FOUND Name",
                     "DBG return: invokeMethod(): CMPI_RC_ERR_METHOD_NOT_FOUND Nothing"}));
}

TEST_F(Method_Operations, InheritedMethodsAreFoundInTheClassOfThePath)
{
    script.invoke = [](const Instance*, Instance*) { return 0; };
    EXPECT_EQ(invoke(path_of("Sample_Port", "p"), "Reset").rc, CMPI_RC_OK);
    EXPECT_EQ(script.calls, Texts{"invoke"});
}

TEST_F(Thing_Methods, AMethodNamedLikeTheClassOfItsPathIsRefused)
{
    Log_Capture capture;
    EXPECT_EQ(invoke(class_path("thing"), "THING").rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_TRUE(script.calls.empty());
    EXPECT_EQ(capture.said("DBG return"), Texts{"DBG return: invokeMethod(): CMPI_RC_ERR_INVALID_CLASS"});
    EXPECT_EQ(invoke(class_path("Thing"), "Count").rc, CMPI_RC_OK);
}

TEST_F(Thing_Methods, InstancesGoInByValueAndByNameAndOutByName)
{
    script.invoke = [](const Instance*, Instance* method) {
        auto* const record = static_cast<Thing_Choose_method*>(method);
        EXPECT_EQ(record->Candidates.value.size(), 2u);
        if (record->Candidates.value.size() != 2)
            return 130;
        Instance* const second = record->Candidates.value[1];
        EXPECT_EQ(second->__meta_class, &Sample_Port::static_meta_class) << "most derived class kept";
        EXPECT_EQ(record->Who->__meta_class, &Sample_Element::static_meta_class);
        record->Chosen = second;
        ref(second);
        const String reasons[] = {"one", "two"};
        record->Reasons.value.assign(reasons, 2);
        record->Reasons.null = 0;
        record->return_value.set("chosen");
        return 0;
    };
    const broker::Instance_Value first{path_of("Sample_Element", "first"),
                                       {{"Name", broker::Plain_Value::text("first")}}};
    const broker::Instance_Value second{path_of("Sample_Port", "second"),
                                        {{"Name", broker::Plain_Value::text("second")},
                                         {"Number", broker::Plain_Value::unsigned_number(CMPI_uint64, 2)}}};
    const Result result = invoke(
        class_path("Thing"), "Choose",
        {{"Candidates", broker::Plain_Value::array(CMPI_instance, {broker::Plain_Value::instance(first),
                                                                   broker::Plain_Value::instance(second)})},
         {"Who", broker::Plain_Value::path(path_of("Sample_Element", "w"))}});
    EXPECT_EQ(result.rc, CMPI_RC_OK);
    EXPECT_EQ(result.return_value, broker::Plain_Value::text("chosen"));
    const broker::Plain_Value* const chosen = broker::find_value(result.out, "Chosen");
    ASSERT_NE(chosen, nullptr);
    EXPECT_EQ(chosen->type, CMPI_ref);
    EXPECT_EQ(chosen->as_path()->class_name, "Sample_Port");
    EXPECT_EQ(text_of_key(*chosen->as_path(), "Name"), "second");
    EXPECT_EQ(broker::find_value(result.out, "Reasons")->elements().size(), 2u);
}

TEST_F(Thing_Methods, ANullArraySentAsABooleanIsAnEmptyArray)
{
    uint32 size = 99;
    script.invoke = [&](const Instance*, Instance* method) {
        size = static_cast<Thing_Choose_method*>(method)->Candidates.value.size();
        return 0;
    };
    EXPECT_EQ(
        invoke(class_path("Thing"), "Choose", {{"Candidates", broker::Plain_Value::null_of(CMPI_boolean)}})
            .rc,
        CMPI_RC_OK);
    EXPECT_EQ(size, 0u);
}

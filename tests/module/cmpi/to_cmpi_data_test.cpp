#include "module/cmpi/cmpi_types.h"
#include "module/cmpi/to_cmpi_data.h"
#include "module/runtime/ground/type_dispatch.h"
#include "tests/module/cmpi/Plain_Samples.h"
#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

#include <cmpimacs.h>

using namespace KPRV;
using KPRV::Value;

namespace {

class To_Cmpi_Data : public testing::Test
{
protected:
    int convert(const Value& value, CMPIData& data, uint32 flags = 0, const char* name_space = NAME_SPACE)
    {
        memset(&data, 0xEE, sizeof(data));
        return _to_cmpi_data(&sample_repository, server.broker.cmpi(), name_space, value, flags, data);
    }
    CMPIData convert(const Value& value, uint32 flags = 0)
    {
        CMPIData data;
        EXPECT_EQ(convert(value, data, flags), 0);
        EXPECT_EQ(data.state, CMPI_goodValue);
        return data;
    }
    /// The words that a failing conversion logs.
    Texts words(const Value& value, uint32 flags = 0, const char* name_space = NAME_SPACE)
    {
        Log_Capture capture;
        CMPIData data;
        EXPECT_EQ(convert(value, data, flags, name_space), -1);
        return capture.said();
    }
    template <class T>
    void expect_plain(CMPIType word, T x)
    {
        Value value;
        value.set_value(x);
        const CMPIData data = convert(value);
        EXPECT_EQ(data.type, word);
        EXPECT_EQ(load_plain<T>(data.value), x);

        const T elements[] = {x, T()};
        value.set_value(Array<T>(elements, 2));
        const CMPIData array = convert(value);
        EXPECT_EQ(array.type, word | CMPI_ARRAY);
        ASSERT_EQ(CMGetArrayCount(array.value.array, nullptr), 2u);
        const CMPIData element = CMGetArrayElementAt(array.value.array, 0, nullptr);
        EXPECT_EQ(element.type, word);
        EXPECT_EQ(load_plain<T>(element.value), x);
    }
    static Value instance_value(Instance* instance)
    {
        Value value;
        value.set_value(instance);
        return value;
    }

    Test_Server server;
    broker::Mi_Frame frame{server.broker, {}};
};

} // namespace

TEST_F(To_Cmpi_Data, NumbersAreCopied)
{
    for_each_plain_sample([&](CMPIType type, auto x) { expect_plain(type, x); });
}

TEST_F(To_Cmpi_Data, StringsBecomeObjects)
{
    Value value;
    value.set_value("text");
    const CMPIData data = convert(value);
    EXPECT_EQ(data.type, CMPI_string);
    EXPECT_STREQ(CMGetCharPtr(data.value.string), "text");

    const String texts[] = {"one", ""};
    value.set_value(Array<String>(texts, 2));
    const CMPIData array = convert(value);
    EXPECT_EQ(array.type, CMPI_stringA);
    EXPECT_STREQ(CMGetCharPtr(CMGetArrayElementAt(array.value.array, 0, nullptr).value.string), "one");
    EXPECT_STREQ(CMGetCharPtr(CMGetArrayElementAt(array.value.array, 1, nullptr).value.string), "");
}

TEST_F(To_Cmpi_Data, DatetimesGoByTheirText)
{
    Value value;
    value.set_value(Datetime(5 * Datetime::MIN));
    const CMPIData data = convert(value);
    EXPECT_EQ(data.type, CMPI_dateTime);
    EXPECT_STREQ(CMGetCharPtr(CMGetStringFormat(data.value.dateTime, nullptr)), "00000000000500.000000:000");

    const Datetime datetimes[] = {Datetime(Datetime::SEC)};
    value.set_value(Array<Datetime>(datetimes, 1));
    const CMPIData array = convert(value);
    EXPECT_EQ(array.type, CMPI_dateTimeA);
    const CMPIData element = CMGetArrayElementAt(array.value.array, 0, nullptr);
    EXPECT_STREQ(CMGetCharPtr(CMGetStringFormat(element.value.dateTime, nullptr)),
                 "00000000000001.000000:000");
}

TEST_F(To_Cmpi_Data, EmptyArraysAreArrays)
{
    Value value;
    value.set_value(Array<uint32>());
    const CMPIData data = convert(value);
    EXPECT_EQ(data.type, CMPI_uint32A);
    EXPECT_EQ(CMGetArrayCount(data.value.array, nullptr), 0u);
    value.set_value(Array<Instance*>());
    EXPECT_EQ(convert(value).type, CMPI_refA);
}

TEST_F(To_Cmpi_Data, TheFlagsTellEmbeddedInstancesFromReferences)
{
    const Value value = instance_value(make_port("p", 7));
    const CMPIData reference = convert(value);
    EXPECT_EQ(reference.type, CMPI_ref);
    EXPECT_STREQ(CMGetCharPtr(CMGetClassName(reference.value.ref, nullptr)), "Sample_Port");
    EXPECT_STREQ(CMGetCharPtr(CMGetNameSpace(reference.value.ref, nullptr)), NAME_SPACE);
    EXPECT_EQ(CMGetKeyCount(reference.value.ref, nullptr), 2u);
    for (const uint32 flag : {FLAG_EMBEDDED_INSTANCE, FLAG_EMBEDDED_OBJECT}) {
        const CMPIData embedded = convert(value, flag | FLAG_OUT);
        EXPECT_EQ(embedded.type, CMPI_instance);
        EXPECT_EQ(CMGetPropertyCount(embedded.value.inst, nullptr), 8u) << "all but Load, which is null";
    }
    EXPECT_EQ(convert(value, ~(FLAG_EMBEDDED_INSTANCE | FLAG_EMBEDDED_OBJECT)).type, CMPI_ref);
}

TEST_F(To_Cmpi_Data, InstanceArrays)
{
    Array<Instance*> elements;
    elements.append(make_named("a"));
    elements.append(make_port("p"));
    Value value;
    value.set_value(elements);
    const CMPIData references = convert(value);
    EXPECT_EQ(references.type, CMPI_refA);
    EXPECT_EQ(CMGetArrayElementAt(references.value.array, 1, nullptr).type, CMPI_ref);
    const CMPIData embedded = convert(value, FLAG_EMBEDDED_INSTANCE);
    EXPECT_EQ(embedded.type, CMPI_instanceA);
    EXPECT_EQ(CMGetArrayElementAt(embedded.value.array, 0, nullptr).type, CMPI_instance);
}

TEST_F(To_Cmpi_Data, AnInstanceKeepsItsNameSpaceOrTakesThatOfTheCall)
{
    Sample_Element* const element = make_named("a");
    element->__name_space = "root/own";
    const Value value = instance_value(element);
    CMPIData data;
    ASSERT_EQ(convert(value, data, 0, nullptr), 0);
    EXPECT_STREQ(CMGetCharPtr(CMGetNameSpace(data.value.ref, nullptr)), "root/own");
}

TEST_F(To_Cmpi_Data, FailuresOfInstancesHaveTheirWords)
{
    EXPECT_EQ(words(instance_value(nullptr)), Texts{"WARN null instance argument"});
    EXPECT_EQ(words(instance_value(make_named("a")), 0, nullptr), Texts{"WARN null namespace"});
    EXPECT_EQ(words(instance_value(make_named("a")), 0, ""), Texts{"WARN null namespace"});

    Meta_Class nameless = Sample_Element::static_meta_class;
    nameless.name = "";
    EXPECT_EQ(words(instance_value(create(&nameless, true))), Texts{"WARN null classname"});

    server.core->calls.fail("CMNewObjectPath", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(words(instance_value(make_named("a"))), Texts{"WARN CMNewObjectPath() failed"});
    server.core->calls.fail("CMNewInstance", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(words(instance_value(make_named("a")), FLAG_EMBEDDED_OBJECT),
              Texts{"WARN CMNewInstance() failed"});

    Log_Capture capture;
    const Ref<Instance> element(make_named("a"));
    CMPIData data = {};
    EXPECT_EQ(to_cmpi_scalar<Instance*>::func(&sample_repository, server.broker.cmpi(), NAME_SPACE,
                                              element.ptr(), CMPI_string, data),
              -1);
    EXPECT_EQ(capture.said(), Texts{"WARN unexpected type"});
}

TEST_F(To_Cmpi_Data, FailuresOfArraysHaveTheirWords)
{
    const uint32 numbers[] = {1, 2};
    Value value;
    value.set_value(Array<uint32>(numbers, 2));
    server.core->calls.fail("CMSetArrayElementAt", 2, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(words(value), Texts{"WARN CMSetArrayElementAt() failed"});
    server.core->calls.fail("CMNewArray", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(words(value), Texts{});

    Array<Instance*> elements;
    elements.append(make_named("a"));
    elements.append(nullptr);
    value.set_value(elements);
    EXPECT_EQ(words(value), (Texts{"WARN null instance argument", "WARN element conversion failed"}));
    server.core->calls.fail("CMSetArrayElementAt", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(words(value), Texts{"WARN CMSetArrayElementAt() failed"});
}

TEST_F(To_Cmpi_Data, AnObjectThatTheServerDoesNotMakeIsAFailure)
{
    Value value;
    value.set_value("text");
    server.core->calls.fail("CMNewString", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(words(value), Texts{});
    value.set_value(Datetime());
    server.core->calls.fail("CMNewDateTimeFromChars", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(words(value), Texts{});
}

TEST_F(To_Cmpi_Data, MissingAndUnlistedTypes)
{
    EXPECT_EQ(words(Value()), Texts{"WARN missing type"});

    Value value;
    value.type = Value::Type(50);
    CMPIData data;
    EXPECT_EQ(convert(value, data), 0);
    EXPECT_EQ(data.type, CMPI_null);
    EXPECT_EQ(data.state, CMPI_goodValue);
    value.null = true;
    EXPECT_EQ(convert(value, data), 0);
    EXPECT_EQ(data.state, CMPI_nullValue);
    value.type = Value::NONE;
}

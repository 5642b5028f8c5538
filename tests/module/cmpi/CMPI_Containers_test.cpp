#include "module/cmpi/CMPI_Containers.h"
#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

using namespace KPRV;
using KPRV::Value;

namespace {

class CMPI_Containers : public testing::Test
{
protected:
    using Entries = std::vector<broker::Named_Value>;

    CMPIInstance_Container instance(Entries properties, const char* class_name = "Sample_Port")
    {
        return {
            &sample_repository, server.broker.cmpi(), NAME_SPACE,
            broker::make_object<broker::Instance_Object>(
                *server.core, "test", broker::Instance_Value{class_path(class_name), std::move(properties)})
                ->cmpi()};
    }
    CMPIObjectPath_Container path(Entries keys, const char* class_name = "Thing")
    {
        broker::Path_Value content = class_path(class_name);
        content.keys = std::move(keys);
        return {&thing_repository, server.broker.cmpi(), NAME_SPACE,
                broker::make_object<broker::Path_Object>(*server.core, "test", content, true)->cmpi()};
    }
    CMPIArgs_Container args(Entries values)
    {
        last_args = broker::make_object<broker::Args_Object>(*server.core, "test", std::move(values));
        return {&sample_repository, server.broker.cmpi(), NAME_SPACE, last_args->cmpi()};
    }
    /// Reads entry 0 as a type; -1 and words, or 0.
    int read(CMPI_Container&& container, int type)
    {
        return container.get_value(0, Value::Type(type), value);
    }

    Test_Server server;
    broker::Mi_Frame frame{server.broker, {}};
    broker::Args_Object* last_args = nullptr;
    Value value;
};

broker::Plain_Value unsigned_key(uint64 x)
{
    return broker::Plain_Value::unsigned_number(CMPI_uint64, x);
}
broker::Plain_Value signed_key(sint64 x)
{
    return broker::Plain_Value::signed_number(CMPI_sint64, x);
}

} // namespace

TEST_F(CMPI_Containers, SizesAndNames)
{
    const Entries entries = {{"One", broker::Plain_Value::text("1")},
                             {"Two", broker::Plain_Value::text("2")}};
    const auto expect_names = [](CMPI_Container&& container) {
        String name;
        EXPECT_EQ(container.get_size(), 2u);
        EXPECT_EQ(container.get_name(1, name), 0);
        EXPECT_EQ(name, "Two");
    };
    expect_names(instance(entries));
    expect_names(path(entries));
    expect_names(args(entries));
}

TEST_F(CMPI_Containers, BoundsAreTested)
{
    Log_Capture capture;
    const Entries entries = {{"One", broker::Plain_Value::text("1")}};
    const auto expect_bounds = [&](CMPI_Container&& container) {
        String name;
        EXPECT_EQ(container.get_name(1, name), -1);
        EXPECT_EQ(container.get_value(1, Value::Type(STRING), value), -1);
        EXPECT_EQ(value.type, Value::NONE);
    };
    expect_bounds(instance(entries));
    expect_bounds(path(entries));
    expect_bounds(args(entries));
    EXPECT_EQ(capture.said(), Texts(6, "WARN bounds error"));
}

TEST_F(CMPI_Containers, OnlyTheNamesOfPropertiesAreGuarded)
{
    Log_Capture capture;
    String name;
    const Entries entries = {{"One", broker::Plain_Value::text("1")},
                             {"Two", broker::Plain_Value::text("2")}};
    server.core->calls.fail("CMGetPropertyAt", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(instance(entries).get_name(0, name), -1);
    server.core->calls.throw_at("CMGetPropertyAt", 1);
    EXPECT_EQ(instance(entries).get_name(1, name), -1);
    EXPECT_EQ(capture.said(), (Texts{"WARN CMGetPropertyAt() failed",
                                     "WARN CMGetPropertyAt() threw exception: index=1 size=2"}));

    server.core->calls.throw_at("CMGetPropertyAt", 1);
    EXPECT_THROW(instance(entries).get_value(0, Value::Type(STRING), value), std::runtime_error);
    server.core->calls.throw_at("CMGetKeyAt", 1);
    EXPECT_THROW(path(entries).get_name(0, name), std::runtime_error);
    server.core->calls.throw_at("CMGetArgAt", 1);
    EXPECT_THROW(args(entries).get_name(0, name), std::runtime_error);
}

TEST_F(CMPI_Containers, AMissingNameIsAFailure)
{
    String name;
    server.core->calls.fail("CMGetKeyAt", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(path({{"One", broker::Plain_Value::text("1")}}).get_name(0, name), -1);
}

TEST_F(CMPI_Containers, AValueMustHaveItsType)
{
    EXPECT_EQ(read(instance({{"Number", unsigned_key(5)}}), UINT64), 0);
    Log_Capture capture;
    EXPECT_EQ(read(instance({{"Number", unsigned_key(5)}}), UINT32), -1);
    EXPECT_EQ(read(args({{"Count", unsigned_key(5)}}), UINT32), -1);
    EXPECT_EQ(read(instance({{"Number", broker::Plain_Value::null_of(CMPI_uint16A)}}), STRING), -1);
    EXPECT_EQ(capture.said(), (Texts{"WARN type mismatch on Number: uint64/uint32",
                                     "WARN type mismatch on Count: uint64/uint32",
                                     "WARN type mismatch on Number: uint16_array/string"}));
}

TEST_F(CMPI_Containers, AValueThatDoesNotConvert)
{
    Log_Capture capture;
    EXPECT_EQ(read(args({{"Who", broker::Plain_Value::path(class_path("Foreign"))}}), Value::INSTANCE), -1);
    EXPECT_EQ(capture.said(),
              (Texts{"WARN failed to find meta class: Foreign", "WARN failed to create CIMPLE instance",
                     "WARN cmpi_to_cimple_value() failed"}));
}

TEST_F(CMPI_Containers, UnsignedKeysAreNarrowedToEveryInteger)
{
    const uint64 wide = 0x123456789ABCDEF0;
    const auto narrowed = [&]<class T>(int type) {
        EXPECT_EQ(read(path({{"K", unsigned_key(wide)}}), type), 0) << type;
        T x = 0;
        EXPECT_EQ(value.get_value(x), 0) << type;
        EXPECT_FALSE(value.null);
        return x;
    };
    EXPECT_EQ(narrowed.operator()<uint8>(UINT8), 0xF0);
    EXPECT_EQ(narrowed.operator()<sint8>(SINT8), sint8(0xF0));
    EXPECT_EQ(narrowed.operator()<uint16>(UINT16), 0xDEF0);
    EXPECT_EQ(narrowed.operator()<sint16>(SINT16), sint16(0xDEF0));
    EXPECT_EQ(narrowed.operator()<uint32>(UINT32), 0x9ABCDEF0u);
    EXPECT_EQ(narrowed.operator()<sint32>(SINT32), sint32(0x9ABCDEF0));
    EXPECT_EQ(narrowed.operator()<uint64>(UINT64), wide);
    EXPECT_EQ(narrowed.operator()<sint64>(SINT64), sint64(wide));
}

TEST_F(CMPI_Containers, ANarrowedNullStaysNull)
{
    EXPECT_EQ(read(path({{"K", broker::Plain_Value::null_of(CMPI_uint64)}}), UINT16), 0);
    EXPECT_EQ(value.type, int(UINT16));
    EXPECT_TRUE(value.null);
}

TEST_F(CMPI_Containers, SignedKeysFitUint32Only)
{
    // Below zero the host sends what a server of either kind sends.
    EXPECT_EQ(read(path({{"K", signed_key(-1)}}), UINT32), 0);
    uint32 x = 0;
    EXPECT_EQ(value.get_value(x), 0);
    EXPECT_EQ(x, 0xFFFFFFFFu);
    EXPECT_EQ(read(path({{"K", signed_key(-1)}}), SINT64), 0);
    for (const int type : {UINT8, SINT8, UINT16, SINT16, SINT32, UINT64})
        EXPECT_EQ(read(path({{"K", signed_key(-1)}}), type), -1) << type;
}

TEST_F(CMPI_Containers, OtherKindsOfKeysAreNotNarrowed)
{
    for (const int type : {BOOLEAN, REAL32, REAL64, CHAR16, STRING, DATETIME})
        EXPECT_EQ(read(path({{"K", unsigned_key(1)}}), type), -1) << type;
    EXPECT_EQ(read(path({{"K", broker::Plain_Value::text("1")}}), UINT32), -1);
}

TEST_F(CMPI_Containers, ABooleanArgumentPassesForANullInstanceArray)
{
    EXPECT_EQ(read(args({{"A", broker::Plain_Value::null_of(CMPI_boolean)}}), Value::INSTANCE_ARRAY), 0);
    EXPECT_EQ(value.type, Value::INSTANCE_ARRAY);
    EXPECT_TRUE(value.null);
    EXPECT_EQ(read(args({{"A", broker::Plain_Value::null_of(CMPI_boolean)}}), int(UINT32) | Value::ARRAY_BIT),
              -1);
    EXPECT_EQ(read(instance({{"A", broker::Plain_Value::null_of(CMPI_boolean)}}), Value::INSTANCE_ARRAY), -1);
}

TEST_F(CMPI_Containers, ValuesAreSetInTheServersObjects)
{
    value.set_value(uint64(5));
    auto* const object = broker::make_object<broker::Instance_Object>(
        *server.core, "test", broker::Instance_Value{class_path("Sample_Port"), {}});
    CMPIInstance_Container in_instance(&sample_repository, server.broker.cmpi(), NAME_SPACE, object->cmpi());
    EXPECT_EQ(in_instance.set_value("Number", value, 0), 0);
    EXPECT_EQ(*object->content.property("Number"), unsigned_key(5));

    auto* const target =
        broker::make_object<broker::Path_Object>(*server.core, "test", class_path("Sample_Port"));
    CMPIObjectPath_Container in_path(&sample_repository, server.broker.cmpi(), NAME_SPACE, target->cmpi());
    EXPECT_EQ(in_path.set_value("Number", value, 0), 0);
    EXPECT_EQ(*target->content.key("Number"), unsigned_key(5));

    EXPECT_EQ(args({}).set_value("Any", value, 0), 0);
    EXPECT_EQ(*broker::find_value(last_args->content, "Any"), unsigned_key(5));
}

TEST_F(CMPI_Containers, TheReturnValueIsNoArgument)
{
    value.set_value(uint64(5));
    CMPIArgs_Container container = args({});
    EXPECT_EQ(container.return_value.type, CMPI_null);
    EXPECT_EQ(container.set_value("return_value", value, 0), 0);
    EXPECT_TRUE(last_args->content.empty());
    EXPECT_EQ(container.return_value.type, CMPI_uint64);
    EXPECT_EQ(container.return_value.value.uint64, 5u);

    EXPECT_EQ(container.set_value("Return_Value", value, 0), 0) << "another name: case counts";
    EXPECT_EQ(last_args->content.size(), 1u);
}

TEST_F(CMPI_Containers, FailingSettersHaveTheirWords)
{
    Log_Capture capture;
    value.set_value(uint64(5));
    server.core->calls.fail("CMSetProperty", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(instance({}).set_value("Number", value, 0), -1);
    server.core->calls.fail("CMAddKey", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(path({}).set_value("Word", value, 0), -1);
    server.core->calls.fail("CMAddArg", 1, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(args({}).set_value("Any", value, 0), -1);
    EXPECT_EQ(args({}).set_value("Any", Value(), 0), -1);
    EXPECT_EQ(capture.said(), (Texts{"WARN CMSetProperty() failed: Number", "WARN CMAddKey() failed",
                                     "WARN CMAddArg() failed", "WARN missing type",
                                     "WARN _to_cmpi_data() failed: feature=Any"}));
}

#include "module/cmpi/cmpi_types.h"
#include "module/cmpi/to_cimple_value.h"
#include "module/runtime/ground/type_dispatch.h"
#include "tests/module/cmpi/Fake_Objects.h"
#include "tests/module/cmpi/Plain_Samples.h"
#include "tests/module/cmpi/Test_Server.h"
#include "tests/support/Log_Capture.h"

using namespace KPRV;
using KPRV::Value;

namespace {

int convert(const CMPIData& data, Value& value)
{
    return cmpi_to_cimple_value(&sample_repository, nullptr, NAME_SPACE, data, value);
}

/// The words that a failing conversion logs.
Texts words_of(const CMPIData& data)
{
    Log_Capture capture;
    Value value;
    EXPECT_EQ(convert(data, value), -1);
    return capture.said();
}

template <class T>
CMPIData plain_data(CMPIType type, T x)
{
    CMPIData data = fake_data(type);
    store_plain(data.value, x);
    return data;
}

template <class T>
void expect_plain(CMPIType type, T x)
{
    Value value;
    ASSERT_EQ(convert(plain_data(type, x), value), 0);
    EXPECT_EQ(value.type, int(Type_Code<T>::value));
    EXPECT_FALSE(value.null);
    T out = T();
    EXPECT_EQ(value.get_value(out), 0);
    EXPECT_EQ(out, x);

    const Fake_Array array({plain_data(type, x), plain_data(type, T())});
    ASSERT_EQ(convert(fake_data(type, array), value), 0);
    EXPECT_EQ(value.type, int(Type_Code<T>::value) | Value::ARRAY_BIT);
    Array<T> elements;
    EXPECT_EQ(value.get_value(elements), 0);
    ASSERT_EQ(elements.size(), 2u);
    EXPECT_EQ(elements[0], x);
    EXPECT_EQ(elements[1], T());
}

} // namespace

TEST(to_cimple_value, TypeWords)
{
    const struct
    {
        CMPIType word;
        int type;
    } rows[] = {{2, 0},     {128, 1},   {192, 2},   {144, 3}, {208, 4}, {160, 5},   {224, 6},
                {176, 7},   {240, 8},   {8, 9},     {12, 10}, {3, 11},  {5632, 12}, {6144, 13},
                {4096, 14}, {4352, 14}, {5888, -1}, {0, -1},  {1, -1},  {4608, -1}};
    for (const auto& row : rows) {
        EXPECT_EQ(value_type_of(row.word), row.type) << row.word;
        const CMPIType array_word = CMPIType(row.word + 8192);
        EXPECT_EQ(value_type_of(array_word), row.type == -1 ? -1 : row.type + 128) << array_word;
    }
}

TEST(to_cimple_value, NumbersAreCopied)
{
    for_each_plain_sample([](CMPIType type, auto x) { expect_plain(type, x); });
}

TEST(to_cimple_value, AnyNonzeroByteIsTrue)
{
    CMPIData data = fake_data(CMPI_boolean);
    data.value.uint8 = 4;
    Value value;
    boolean x = false;
    ASSERT_EQ(convert(data, value), 0);
    EXPECT_EQ(value.get_value(x), 0);
    EXPECT_TRUE(x);
}

TEST(to_cimple_value, OtherStateBitsDoNotMakeANull)
{
    CMPIData data = plain_data<uint32>(CMPI_uint32, 7);
    data.state = CMPI_keyValue | CMPI_badValue | CMPI_notFound;
    Value value;
    ASSERT_EQ(convert(data, value), 0);
    EXPECT_FALSE(value.null);
}

TEST(to_cimple_value, EveryTypeHasItsNull)
{
    for (int type = 0; type < int(NUM_TYPES); type++) {
        for (const CMPIType array_bit : {0, CMPI_ARRAY}) {
            CMPIData data = fake_data(CMPIType(cmpi_type_words[type] | array_bit), CMPI_nullValue);
            memset(&data.value, 0xEE, sizeof(data.value)); // must not be looked at
            Value value;
            ASSERT_EQ(convert(data, value), 0);
            EXPECT_EQ(value.type, array_bit ? type | Value::ARRAY_BIT : type);
            EXPECT_TRUE(value.null);
        }
    }
    for (const CMPIType word : {CMPI_instance, CMPI_ref}) {
        Value value;
        Instance* instance = reinterpret_cast<Instance*>(&value);
        ASSERT_EQ(convert(fake_data(word, CMPI_nullValue), value), 0);
        EXPECT_EQ(value.get_value(instance), 0);
        EXPECT_EQ(instance, nullptr);
        EXPECT_TRUE(value.null);
        ASSERT_EQ(convert(fake_data(CMPIType(word | CMPI_ARRAY), CMPI_nullValue), value), 0);
        EXPECT_EQ(value.type, Value::INSTANCE_ARRAY);
        EXPECT_TRUE(value.null);
    }
}

TEST(to_cimple_value, TypedNullsHoldZeroAndEmpty)
{
    Value value;
    uint32 number = 5;
    ASSERT_EQ(convert(fake_data(CMPI_uint32, CMPI_nullValue), value), 0);
    value.get_value(number);
    EXPECT_EQ(number, 0u);
    String text("x");
    ASSERT_EQ(convert(fake_data(CMPI_string, CMPI_nullValue), value), 0);
    value.get_value(text);
    EXPECT_EQ(text, "");
    Datetime datetime(1);
    ASSERT_EQ(convert(fake_data(CMPI_dateTime, CMPI_nullValue), value), 0);
    value.get_value(datetime);
    EXPECT_EQ(datetime, Datetime());
}

TEST(to_cimple_value, UnknownWords)
{
    EXPECT_EQ(words_of(fake_data(CMPI_chars, CMPI_nullValue)), Texts{"WARN unknown cmpi type 5888"});
    EXPECT_EQ(words_of(fake_data(0, CMPI_nullValue)), Texts{"WARN unknown cmpi type 0"});
    EXPECT_EQ(words_of(fake_data(CMPI_chars)), Texts{"WARN unreachable"});
    EXPECT_EQ(words_of(fake_data(CMPI_charsA)), Texts{"WARN unreachable"});
}

TEST(to_cimple_value, Strings)
{
    const Fake_String string("text");
    Value value;
    ASSERT_EQ(convert(fake_data(string), value), 0);
    String text;
    EXPECT_EQ(value.get_value(text), 0);
    EXPECT_EQ(text, "text");
    EXPECT_FALSE(value.null);
}

TEST(to_cimple_value, MissingTextsAreEmptyAndNotNull)
{
    Log_Capture capture;
    const Fake_String without_text(nullptr);
    for (const CMPIData& data : {fake_data(CMPI_string), fake_data(without_text)}) {
        Value value;
        ASSERT_EQ(convert(data, value), 0);
        String text("x");
        EXPECT_EQ(value.get_value(text), 0);
        EXPECT_EQ(text, "");
        EXPECT_FALSE(value.null);
    }
    EXPECT_EQ(capture.said(), (Texts{"INFO ignored null CMPI string", "WARN CMGetCharsPtr() failed"}));
}

TEST(to_cimple_value, StringArraysHaveTheSameTolerance)
{
    Log_Capture capture;
    const Fake_String text("text"), without_text(nullptr);
    const Fake_Array array({fake_data(text), fake_data(without_text), fake_data(CMPI_string)});
    Value value;
    ASSERT_EQ(convert(fake_data(CMPI_string, array), value), 0);
    Array<String> texts;
    EXPECT_EQ(value.get_value(texts), 0);
    ASSERT_EQ(texts.size(), 3u);
    EXPECT_EQ(texts[0], "text");
    EXPECT_EQ(texts[1], "");
    EXPECT_EQ(texts[2], "");
    EXPECT_EQ(capture.said(), (Texts{"WARN CMGetCharsPtr() failed", "INFO ignored null CMPI string"}));
}

TEST(to_cimple_value, DatetimesGoThroughTheirText)
{
    const Fake_Datetime interval("00000000000500.000000:000");
    Value value;
    ASSERT_EQ(convert(fake_data(interval), value), 0);
    Datetime datetime;
    EXPECT_EQ(value.get_value(datetime), 0);
    EXPECT_EQ(datetime, Datetime(5 * Datetime::MIN));

    const Fake_Array array({fake_data(interval)});
    ASSERT_EQ(convert(fake_data(CMPI_dateTime, array), value), 0);
    Array<Datetime> datetimes;
    EXPECT_EQ(value.get_value(datetimes), 0);
    EXPECT_EQ(datetimes[0], datetime);
}

TEST(to_cimple_value, FailingDatetimes)
{
    const Fake_Datetime missing(nullptr), failing("00000000000500.000000:000", CMPI_RC_ERR_FAILED),
        wrong("x");
    EXPECT_EQ(words_of(fake_data(missing)), Texts{"WARN CMGetStringFormat() failed"});
    EXPECT_EQ(words_of(fake_data(failing)), Texts{"WARN CMGetStringFormat() failed"});
    EXPECT_EQ(words_of(fake_data(CMPI_dateTime)), Texts{"WARN CMGetStringFormat() failed"});
    EXPECT_EQ(words_of(fake_data(wrong)), Texts{"WARN conversion error"});
    const Fake_Array array({fake_data(wrong)});
    EXPECT_EQ(words_of(fake_data(CMPI_dateTime, array)), Texts{"WARN conversion error"});
}

TEST(to_cimple_value, Arrays)
{
    EXPECT_EQ(words_of(fake_data(CMPI_uint32A)), Texts{}) << "no array object: no word";
    EXPECT_EQ(words_of(fake_data(CMPI_instanceA)), Texts{});

    const Fake_Array empty({});
    for (const CMPIType word : {CMPI_uint32, CMPI_string, CMPI_dateTime, CMPI_instance}) {
        Value value;
        ASSERT_EQ(convert(fake_data(word, empty), value), 0);
        EXPECT_FALSE(value.null);
    }
    const Fake_Array mixed({plain_data<uint32>(CMPI_uint32, 1), plain_data<uint16>(CMPI_uint16, 1)});
    EXPECT_EQ(words_of(fake_data(CMPI_uint32, mixed)), Texts{"WARN type mismatch"});
    const Fake_Array with_null({fake_data(CMPI_uint32, CMPI_nullValue)});
    EXPECT_EQ(words_of(fake_data(CMPI_uint32, with_null)), Texts{"WARN encountered null array element"});
    const Fake_Array null_text({fake_data(CMPI_string, CMPI_nullValue)});
    EXPECT_EQ(words_of(fake_data(CMPI_string, null_text)), Texts{"WARN encountered null array element"});
}

TEST(to_cimple_value, AMissingObjectIsANullInstance)
{
    for (const CMPIType word : {CMPI_instance, CMPI_ref}) {
        Value value;
        ASSERT_EQ(convert(fake_data(word), value), 0);
        Instance* instance = reinterpret_cast<Instance*>(&value);
        EXPECT_EQ(value.get_value(instance), 0);
        EXPECT_EQ(instance, nullptr);
    }
}

namespace {

/// Objects of a server, in a frame that frees them.
struct Served_Objects
{
    Test_Server server;
    broker::Mi_Frame frame{server.broker, {}};

    CMPIData path(const broker::Path_Value& x)
    {
        CMPIData data = fake_data(CMPI_ref);
        data.value.ref = broker::make_object<broker::Path_Object>(*server.core, "test", x)->cmpi();
        return data;
    }
    CMPIData instance(const broker::Instance_Value& x)
    {
        CMPIData data = fake_data(CMPI_instance);
        data.value.inst = broker::make_object<broker::Instance_Object>(*server.core, "test", x)->cmpi();
        return data;
    }
};

} // namespace

TEST(to_cimple_value, InstancesAndReferences)
{
    Served_Objects objects;
    Value value;
    ASSERT_EQ(convert(objects.path(path_of("sample_port", "p")), value), 0);
    Instance* instance = nullptr;
    EXPECT_EQ(value.get_value(instance), 0);
    EXPECT_EQ(instance->__meta_class, &Sample_Port::static_meta_class);
    EXPECT_EQ(name_of_sample(instance), "p");

    ASSERT_EQ(convert(objects.instance({path_of("Sample_Element", "e"),
                                        {{"Caption", broker::Plain_Value::text("caption")}}}),
                      value),
              0);
    EXPECT_EQ(value.get_value(instance), 0);
    EXPECT_EQ(static_cast<Sample_Element*>(instance)->Caption.value, "caption");
}

TEST(to_cimple_value, AnInstanceThatDoesNotConvert)
{
    Served_Objects objects;
    EXPECT_EQ(words_of(objects.path(class_path("Foreign"))),
              (Texts{"WARN failed to find meta class: Foreign", "WARN failed to create CIMPLE instance"}));
}

TEST(to_cimple_value, InstanceArraysKeepNullElements)
{
    Served_Objects objects;
    const Fake_Array array({objects.path(path_of("Sample_Element", "e")), fake_data(CMPI_ref, CMPI_nullValue),
                            objects.path(path_of("Sample_Port", "p"))});
    Value value;
    ASSERT_EQ(convert(fake_data(CMPI_ref, array), value), 0);
    Array<Instance*> elements;
    EXPECT_EQ(value.get_value(elements), 0);
    ASSERT_EQ(elements.size(), 3u);
    EXPECT_EQ(name_of_sample(elements[0]), "e");
    EXPECT_EQ(elements[1], nullptr);
    EXPECT_EQ(elements[2]->__meta_class, &Sample_Port::static_meta_class);
    EXPECT_EQ(elements[0]->__refs, 1) << "the value's own";
}

TEST(to_cimple_value, InstanceArraysRefuseWhatIsNoInstance)
{
    Served_Objects objects;
    const CMPIData good = objects.path(path_of("Sample_Element", "e"));
    // The good element before the bad one is released again: the address sanitizer watches.
    const Fake_Array mixed({good, fake_data(CMPI_instance, CMPI_nullValue)});
    EXPECT_EQ(words_of(fake_data(CMPI_ref, mixed)), Texts{"WARN array element type mismatch"});
    const Fake_Array hollow({good, fake_data(CMPI_ref)});
    EXPECT_EQ(words_of(fake_data(CMPI_ref, hollow)), Texts{"WARN encountered null instance element"});
    const Fake_Array foreign({good, objects.path(class_path("Foreign"))});
    EXPECT_EQ(words_of(fake_data(CMPI_ref, foreign)),
              (Texts{"WARN failed to find meta class: Foreign", "WARN failed to create CIMPLE instance"}));
}

TEST(to_cimple_value, WordsVanishWhenLoggingIsSwitchedOff)
{
    log_enable(false);
    EXPECT_EQ(words_of(fake_data(CMPI_chars)), Texts{});
    log_enable(true);
}

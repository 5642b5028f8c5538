#include "module/runtime/objects/put_property_from_str.h"

#include "module/runtime/objects/Ref.h"
#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

namespace KPRV {

namespace {

struct Put_Property : testing::Test
{
    const Ref<Sample_Types> record{create<Sample_Types>(true)};

    int put(const char* feature, const char* text)
    {
        const Meta_Feature* found = find_feature(record->__meta_class, feature, FLAG_PROPERTY);
        return __put_property_from_str(record.ptr(), static_cast<const Meta_Property*>(found), text);
    }
};

} // namespace

TEST_F(Put_Property, ScalarsOfEveryType)
{
#define PUTS(CODE, TEXT, VALUE)                                                                              \
    EXPECT_EQ(1, record->Scalar_##CODE.null);                                                                \
    EXPECT_EQ(0, put("Scalar_" #CODE, TEXT));                                                                \
    EXPECT_EQ(0, record->Scalar_##CODE.null);                                                                \
    EXPECT_EQ(VALUE, record->Scalar_##CODE.value);
    PUTS(BOOLEAN, "TRUE", true)
    PUTS(UINT8, "255", 255)
    PUTS(SINT8, "-128", -128)
    PUTS(UINT16, "0xFFFF", 65535)
    PUTS(SINT16, "-32768", -32768)
    PUTS(UINT32, "4294967295", 4294967295u)
    PUTS(SINT32, "+7", 7)
    PUTS(UINT64, "18446744073709551615", ~uint64(0))
    PUTS(SINT64, "-1", -1)
    PUTS(REAL32, "1.5", 1.5f)
    PUTS(REAL64, "-2.5e1", -25.0)
    PUTS(CHAR16, "xyz", u'x')
    PUTS(STRING, "a text", String("a text"))
    PUTS(DATETIME, "00000000000500.000000:000", Datetime(5 * Datetime::MIN))
#undef PUTS
}

TEST_F(Put_Property, ArraysGrowByOneElement)
{
#define APPENDS(CODE, FIRST, SECOND, VALUE)                                                                  \
    EXPECT_EQ(0, put("Array_" #CODE, FIRST));                                                                \
    EXPECT_EQ(0, record->Array_##CODE.null);                                                                 \
    EXPECT_EQ(0, put("Array_" #CODE, SECOND));                                                               \
    ASSERT_EQ(2u, record->Array_##CODE.value.size());                                                        \
    EXPECT_EQ(VALUE, record->Array_##CODE.value[1]);
    APPENDS(BOOLEAN, "false", "true", true)
    APPENDS(UINT8, "1", "2", 2)
    APPENDS(SINT8, "1", "-2", -2)
    APPENDS(UINT16, "1", "2", 2)
    APPENDS(SINT16, "1", "-2", -2)
    APPENDS(UINT32, "1", "2", 2u)
    APPENDS(SINT32, "1", "-2", -2)
    APPENDS(UINT64, "1", "2", 2u)
    APPENDS(SINT64, "1", "-2", -2)
    APPENDS(REAL32, "1.0", "2.0", 2.0f)
    APPENDS(REAL64, "1.0", "2.0", 2.0)
    APPENDS(CHAR16, "a", "b", u'b')
    APPENDS(STRING, "", "b", String("b"))
    APPENDS(DATETIME, "00000000000001.000000:000", "00000000000002.000000:000", Datetime(2 * Datetime::SEC))
#undef APPENDS
}

TEST_F(Put_Property, WhatDoesNotParseLeavesTheValueButIsNoNullAnyMore)
{
    record->Scalar_UINT8.value = 5;
    EXPECT_EQ(-1, put("Scalar_UINT8", "256"));
    EXPECT_EQ(0, record->Scalar_UINT8.null);
    EXPECT_EQ(5, record->Scalar_UINT8.value);
    EXPECT_EQ(-1, put("Array_UINT8", "x"));
    EXPECT_EQ(0, record->Array_UINT8.null);
    EXPECT_TRUE(record->Array_UINT8.value.empty());
    const std::pair<const char*, const char*> refused[] = {
        {"BOOLEAN", "1"}, {"SINT8", "128"},  {"UINT16", "65536"}, {"SINT16", "x"},
        {"UINT32", "-1"}, {"SINT32", ""},    {"UINT64", "0xf"},   {"SINT64", "9223372036854775808"},
        {"REAL32", "1"},  {"REAL64", "1e5"}, {"DATETIME", "now"}, {"DATETIME", ""},
    };
    for (const auto& [type, text] : refused) {
        EXPECT_EQ(-1, put((std::string("Scalar_") + type).c_str(), text)) << type;
        EXPECT_EQ(-1, put((std::string("Array_") + type).c_str(), text)) << type;
    }
    EXPECT_EQ(0, record->Scalar_DATETIME.null);
    EXPECT_EQ(Datetime(), record->Scalar_DATETIME.value);
}

TEST_F(Put_Property, ACharacterIsTheFirstByteWithItsSign)
{
    EXPECT_EQ(0, put("Scalar_CHAR16", "\xE4rger"));
    EXPECT_EQ(char16(0xFFE4), record->Scalar_CHAR16.value);
    EXPECT_EQ(0, put("Scalar_CHAR16", "\x7F"));
    EXPECT_EQ(char16(0x7F), record->Scalar_CHAR16.value);
    EXPECT_EQ(0, put("Scalar_CHAR16", ""));
    EXPECT_EQ(char16(0), record->Scalar_CHAR16.value);
}

TEST_F(Put_Property, AnEmptyStringIsAValue)
{
    EXPECT_EQ(0, put("Scalar_STRING", ""));
    EXPECT_EQ(0, record->Scalar_STRING.null);
}

} // namespace KPRV

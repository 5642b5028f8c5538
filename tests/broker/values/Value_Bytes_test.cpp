#include "broker/values/Value_Bytes.h"

#include <gtest/gtest.h>

namespace KPRV::broker {
namespace {

Plain_Value read_back(const Plain_Value& value)
{
    Byte_Writer writer;
    writer.value(value);
    return Byte_Reader(writer.bytes()).value();
}

Path_Value a_path()
{
    return {
        .host = "h",
        .name_space = "root/x",
        .class_name = "C",
        .keys = {{"Id", Plain_Value::unsigned_number(CMPI_uint8, 7)},
                 {"Other", Plain_Value::path({.class_name = "D", .keys = {{"K", Plain_Value::text("k")}}})}}};
}

TEST(Value_Bytes, EachKindOfValueComesBackAsItWas)
{
    const Plain_Value values[] = {
        {},
        Plain_Value::null_of(CMPI_stringA),
        Plain_Value::boolean(true),
        Plain_Value::boolean(false),
        Plain_Value::text(""),
        Plain_Value::text(std::string("a\0b", 3)),
        Plain_Value::text(std::string(300, 'x')),
        Plain_Value::datetime("20260102030405.000006+060"),
        Plain_Value::unsigned_number(CMPI_char16, 0),
        Plain_Value::unsigned_number(CMPI_uint64, 127),
        Plain_Value::unsigned_number(CMPI_uint64, 128),
        Plain_Value::unsigned_number(CMPI_uint64, ~std::uint64_t(0)),
        Plain_Value::signed_number(CMPI_sint8, -1),
        Plain_Value::signed_number(CMPI_sint64, std::int64_t(1) << 63),
        Plain_Value::real(CMPI_real32, -0.5),
        Plain_Value::real(CMPI_real64, 1e300),
        Plain_Value::path(a_path()),
        Plain_Value::instance({.path = a_path(), .properties = {{"P", Plain_Value::null_of(CMPI_uint16)}}}),
        Plain_Value::array(CMPI_uint16, {}),
        Plain_Value::array(CMPI_string, {Plain_Value::text("a"), Plain_Value::null_of(CMPI_string)}),
    };
    for (const Plain_Value& value : values)
        EXPECT_EQ(value, read_back(value)) << value.type << " " << value.data.index();
}

TEST(Value_Bytes, WhatStandsBehindEachOtherIsReadInThatOrder)
{
    const Instance_Value instance = {.path = a_path(), .properties = {{"Name", Plain_Value::text("n")}}};
    Byte_Writer writer;
    writer.number(300);
    writer.instance(instance);
    writer.path(a_path());
    writer.text("end");
    Byte_Reader reader(writer.bytes());
    EXPECT_EQ(300u, reader.number());
    EXPECT_EQ(instance, reader.instance());
    EXPECT_EQ(a_path(), reader.path());
    EXPECT_EQ("end", reader.text());
    // Behind the end there is nothing.
    EXPECT_EQ(0u, reader.number());
    EXPECT_EQ("", reader.text());
}

} // namespace
} // namespace KPRV::broker

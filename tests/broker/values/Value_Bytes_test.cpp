#include "broker/values/Value_Bytes.h"

#include <gtest/gtest.h>

namespace KPRV::broker {
namespace {

Value read_back(const Value& value)
{
    Byte_Writer writer;
    writer.value(value);
    return Byte_Reader(writer.bytes()).value();
}

Path_Value a_path()
{
    return {.host = "h",
            .name_space = "root/x",
            .class_name = "C",
            .keys = {{"Id", Value::unsigned_number(CMPI_uint8, 7)},
                     {"Other", Value::path({.class_name = "D", .keys = {{"K", Value::text("k")}}})}}};
}

TEST(Value_Bytes, EachKindOfValueComesBackAsItWas)
{
    const Value values[] = {
        {},
        Value::null_of(CMPI_stringA),
        Value::boolean(true),
        Value::boolean(false),
        Value::text(""),
        Value::text(std::string("a\0b", 3)),
        Value::text(std::string(300, 'x')),
        Value::datetime("20260102030405.000006+060"),
        Value::unsigned_number(CMPI_char16, 0),
        Value::unsigned_number(CMPI_uint64, 127),
        Value::unsigned_number(CMPI_uint64, 128),
        Value::unsigned_number(CMPI_uint64, ~std::uint64_t(0)),
        Value::signed_number(CMPI_sint8, -1),
        Value::signed_number(CMPI_sint64, std::int64_t(1) << 63),
        Value::real(CMPI_real32, -0.5),
        Value::real(CMPI_real64, 1e300),
        Value::path(a_path()),
        Value::instance({.path = a_path(), .properties = {{"P", Value::null_of(CMPI_uint16)}}}),
        Value::array(CMPI_uint16, {}),
        Value::array(CMPI_string, {Value::text("a"), Value::null_of(CMPI_string)}),
    };
    for (const Value& value : values)
        EXPECT_EQ(value, read_back(value)) << value.type << " " << value.data.index();
}

TEST(Value_Bytes, WhatStandsBehindEachOtherIsReadInThatOrder)
{
    const Instance_Value instance = {.path = a_path(), .properties = {{"Name", Value::text("n")}}};
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

#include "kldrcim/wire/Wire_Text.h"

#include <cmath>
#include <gtest/gtest.h>
#include <limits>

namespace KPRV::kldrcim {

namespace {

Plain_Value read(std::string_view text, int type)
{
    return value_of_wire_text(text, static_cast<CMPIType>(type));
}

void expect_refused(std::string_view text, int type)
{
    try {
        read(text, type);
        ADD_FAILURE() << "\"" << text << "\" was taken";
    } catch (const Wire_Error& error) {
        EXPECT_EQ(CMPI_RC_ERR_TYPE_MISMATCH, error.rc()) << text;
    }
}

} // namespace

TEST(Wire_Text, NamesTypesBothWays)
{
    for (const char* name : {"boolean", "string", "char16", "uint8", "sint8", "uint16", "sint16", "uint32",
                             "sint32", "uint64", "sint64", "real32", "real64", "datetime", "reference"})
        EXPECT_EQ(name, wire_type_name(wire_type_of(name)));
    EXPECT_EQ(CMPI_uint8, wire_type_of("UINT8"));
    EXPECT_EQ(CMPI_null, wire_type_of(""));
    EXPECT_EQ(CMPI_null, wire_type_of("ref"));
    EXPECT_EQ(CMPI_instance, wire_type_of("instance"));
    EXPECT_EQ("string", wire_type_name(CMPI_instance));
    EXPECT_EQ("uint8", wire_type_name(CMPI_uint8A));
}

TEST(Wire_Text, ReadsIntegersAsPeopleWriteThem)
{
    EXPECT_EQ(255U, read("255", CMPI_uint8).as_uint());
    EXPECT_EQ(31U, read(" 0x1F\n", CMPI_uint8).as_uint());
    EXPECT_EQ(7U, read("+007", CMPI_uint64).as_uint());
    EXPECT_EQ(-128, read("-128", CMPI_sint8).as_sint());
    EXPECT_EQ(0U, read("-0", CMPI_uint8).as_uint());
    EXPECT_EQ(std::numeric_limits<std::uint64_t>::max(), read("18446744073709551615", CMPI_uint64).as_uint());
    EXPECT_EQ(std::numeric_limits<std::int64_t>::min(), read("-9223372036854775808", CMPI_sint64).as_sint());
    for (const char* text : {"256", "-1", "", " ", "1 2", "0x", "1.0", "--1", "+-1", "true"})
        expect_refused(text, CMPI_uint8);
    expect_refused("128", CMPI_sint8);
    expect_refused("18446744073709551616", CMPI_uint64);
    expect_refused("9223372036854775808", CMPI_sint64);
}

TEST(Wire_Text, ReadsBooleansInAnyCase)
{
    EXPECT_TRUE(read("TRUE", CMPI_boolean).as_bool());
    EXPECT_FALSE(read(" false ", CMPI_boolean).as_bool());
    expect_refused("1", CMPI_boolean);
    EXPECT_EQ("FALSE", wire_text(Plain_Value::boolean(false)));
}

TEST(Wire_Text, KeepsReals)
{
    for (const double number : {0.0, 1.0, -1.5, 0.1, 1e300, 5e-324, 123456789.125})
        EXPECT_EQ(number, read(wire_text(Plain_Value::real(CMPI_real64, number)), CMPI_real64).as_real());
    EXPECT_EQ("0.1", wire_text(Plain_Value::real(CMPI_real32, 0.1F)));
    EXPECT_EQ("1.0", wire_text(Plain_Value::real(CMPI_real64, 1)));
    EXPECT_EQ("1.0e+300", wire_text(Plain_Value::real(CMPI_real64, 1e300)));
    EXPECT_EQ("-INF", wire_text(Plain_Value::real(CMPI_real32, -INFINITY)));
    EXPECT_TRUE(std::isnan(read("NaN", CMPI_real32).as_real()));
    EXPECT_EQ(INFINITY, read("+INF", CMPI_real64).as_real());
    expect_refused("1e39", CMPI_real32);
    expect_refused("1,5", CMPI_real64);
    expect_refused("1e999", CMPI_real64);
}

TEST(Wire_Text, TakesOneUnitForChar16)
{
    for (const unsigned unit : {0x61U, 0xE4U, 0x20ACU})
        EXPECT_EQ(unit,
                  read(wire_text(Plain_Value::unsigned_number(CMPI_char16, unit)), CMPI_char16).as_uint());
    for (const char* text : {"ab", "", "\xF0\x9F\x98\x80"})
        expect_refused(text, CMPI_char16);
}

TEST(Wire_Text, LooksAtDatetimesAndLeavesStringsAlone)
{
    EXPECT_EQ("20261122100000.000000+060", read(" 20261122100000.000000+060", CMPI_dateTime).as_text());
    EXPECT_EQ("00000001000000.000000:000", read("00000001000000.000000:000", CMPI_dateTime).as_text());
    expect_refused("today", CMPI_dateTime);
    EXPECT_EQ(" \n ", read(" \n ", CMPI_string).as_text());
}

} // namespace KPRV::kldrcim

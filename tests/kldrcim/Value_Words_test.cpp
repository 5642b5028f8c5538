#include "kldrcim/words/Value_Words.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {
namespace {

Plain_Value number(std::uint64_t value)
{
    return Plain_Value::unsigned_number(CMPI_uint16, value);
}

TEST(Value_Words, NumbersRangesAndTheRest)
{
    const auto status = Class_Words("KALDERA_FCPort").of("OperationalStatus");
    EXPECT_EQ("11 (In Service)", worded_text(status, number(11)));
    EXPECT_EQ("20 (DMTF Reserved)", worded_text(status, number(20)));
    EXPECT_EQ("32768 (Vendor Reserved)", worded_text(status, number(0x8000)));
    EXPECT_EQ("65535 (Vendor Reserved)", worded_text(status, number(0xFFFF)));
    const auto type = Class_Words("KALDERA_FCPort").of("PortType");
    EXPECT_STREQ("Vendor Reserved", word_of(type, number(16000)));
    EXPECT_EQ("15999", worded_text(type, number(15999)));
}

TEST(Value_Words, TheirNumbersAsTheQualifierHasThem)
{
    EXPECT_EQ("11", value_map_text({11, 11, ""}));
    EXPECT_EQ("0", value_map_text({0, 0, ""}));
    EXPECT_EQ("13..32767", value_map_text({13, 32767, ""}));
    EXPECT_EQ("32768..", value_map_text({32768, 4294967295U, ""}));
    EXPECT_EQ("..9", value_map_text({0, 9, ""}));
    EXPECT_EQ("..", value_map_text({0, 4294967295U, ""}));
}

TEST(Value_Words, TheNearestClassIsTheOneThatCounts)
{
    EXPECT_STREQ("N", word_of(Class_Words("KALDERA_FCPort").of("PortType"), number(10)));
    EXPECT_EQ(nullptr, word_of(Class_Words("KALDERA_EthernetPort").of("PortType"), number(10)));
    EXPECT_STREQ("1000BaseT", word_of(Class_Words("KALDERA_EthernetPort").of("PortType"), number(53)));
    EXPECT_STREQ("Success", word_of(Class_Words("KALDERA_LoopbackDiagnosticTest").of("RunDiagnosticService"),
                                    number(0)));
}

TEST(Value_Words, NamesAreComparedWithoutCase)
{
    EXPECT_FALSE(Class_Words("kaldera_fcport").of("porttype").empty());
    EXPECT_FALSE(Class_Words("CIM_FCPort").of("PortType").empty());
    EXPECT_TRUE(Class_Words("KALDERA_FCPor").of("PortType").empty());
    EXPECT_TRUE(Class_Words("").of("PortType").empty());
    EXPECT_TRUE(Class_Words("KALDERA_FCPort").of("DeviceID").empty());
    EXPECT_TRUE(Class_Words("KALDERA_FCPort", Words::LEFT_OUT).of("PortType").empty());
}

TEST(Value_Words, ArraysNullsAndWhatIsNoNumber)
{
    const auto status = Class_Words("KALDERA_FCPort").of("OperationalStatus");
    EXPECT_EQ("2 (OK), 11 (In Service)",
              worded_text(status, Plain_Value::array(CMPI_uint16, {number(2), number(11)})));
    EXPECT_EQ("{}", worded_text(status, Plain_Value::array(CMPI_uint16, {})));
    EXPECT_EQ(
        "2 (OK), null",
        worded_text(status, Plain_Value::array(CMPI_uint16, {number(2), Plain_Value::null_of(CMPI_uint16)})));
    EXPECT_EQ("null", worded_text(status, Plain_Value::null_of(CMPI_uint16)));
    EXPECT_EQ("eleven", worded_text(status, Plain_Value::text("eleven")));
    EXPECT_EQ("{3, 4}", worded_text({}, Plain_Value::array(CMPI_uint16, {number(3), number(4)})));
}

} // namespace
} // namespace KPRV::kldrcim

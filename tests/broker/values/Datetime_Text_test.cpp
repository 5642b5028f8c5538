#include "broker/values/Datetime_Text.h"

#include <gtest/gtest.h>

namespace KPRV::broker {
namespace {

TEST(Datetime_Text, BothForms)
{
    EXPECT_TRUE(is_datetime_text("20260102030405.000006+060"));
    EXPECT_FALSE(is_interval_text("20260102030405.000006+060"));
    EXPECT_TRUE(is_interval_text("00000001020304.000005:000"));
    EXPECT_TRUE(is_datetime_text("20260102******.******+000"));
    EXPECT_FALSE(is_datetime_text("20260102030405.000006:060"));
    EXPECT_FALSE(is_datetime_text("20260102030405,000006+060"));
    EXPECT_FALSE(is_datetime_text("2026"));
}

TEST(Datetime_Text, Microseconds)
{
    EXPECT_EQ(0u, datetime_microseconds("19700101000000.000000+000"));
    EXPECT_EQ(0u, datetime_microseconds("19700101010000.000000+060"));
    EXPECT_EQ(93784000005u, datetime_microseconds("00000001020304.000005:000"));
    EXPECT_EQ("00000001020304.000005:000", datetime_text(93784000005u, true));
    EXPECT_EQ("20260102030405.000006+000",
              datetime_text(datetime_microseconds("20260102030405.000006+000"), false));
}

} // namespace
} // namespace KPRV::broker

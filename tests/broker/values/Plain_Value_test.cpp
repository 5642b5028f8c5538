#include "broker/values/Plain_Value.h"

#include "tests/support/Live_Blocks.h"

#include <gtest/gtest.h>

namespace KPRV::broker {

TEST(Plain_Value, ACopyForWhichThereIsNoMemoryLeavesNothingBehind)
{
    const Plain_Value text = Plain_Value::text("longer than what a text holds without a block");
    const Plain_Value list = Plain_Value::array(CMPI_string, {text, Plain_Value::null_of(CMPI_string), text});
    for (const Plain_Value& value : {text, list}) {
        const auto copy = [&] {
            const Plain_Value other(value);
            Plain_Value third;
            third = other;
            EXPECT_EQ(value, third);
        };
        EXPECT_EQ("", lost_without_a_block(copy, [] {}));
    }
}

} // namespace KPRV::broker

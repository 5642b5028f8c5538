#include "module/runtime/dispatch/version.h"

#include <gtest/gtest.h>

TEST(version, EverySourceThatIncludesItRefersToTheSymbol)
{
    EXPECT_EQ(KPRV::__cimple_version_symbol, &__cimple_version_2_0_16);
}

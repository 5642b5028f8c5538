#include "module/runtime/version.h"

#include <gtest/gtest.h>

TEST(version, every_source_that_includes_it_refers_to_the_symbol)
{
    EXPECT_EQ(KPRV::__cimple_version_symbol, &__cimple_version_2_0_16);
}

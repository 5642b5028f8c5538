#include "module/runtime/system/assert.h"

#include <gtest/gtest.h>

using namespace KPRV;

TEST(assert, PrintsPlaceAndTextAndAborts)
{
    EXPECT_EXIT(__cimple_assert("File.cpp", 12, "function", "a == b"), testing::KilledBySignal(SIGABRT),
                "^File\\.cpp\\(12\\): function\\(\\): assert: a == b\n\n$");
}

TEST(assert, MacroPassesItsConditionAsText)
{
    const int answer = 41;
    CIMPLE_ASSERT(answer == 41);
    EXPECT_EXIT(CIMPLE_ASSERT(answer == 42), testing::KilledBySignal(SIGABRT), "assert: answer == 42\n\n$");
}

TEST(assert, TraceGoesToStandardError)
{
    testing::internal::CaptureStderr();
    __cimple_trace("File.cpp", 12, "here");
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "TRACE: File.cpp(12): here\n");
}

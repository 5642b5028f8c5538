#include "module/model/Logged_Life.h"

#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

using namespace KPRV;

TEST(Logged_Life, TellsOfTheBeginningAndTheEnd)
{
    Log_Capture log;
    {
        Logged_Life life("Some_Helper", LOG_HERE);
        EXPECT_EQ(log.said(), Lines{"DBG Inside Some_Helper Constructor"});
    }
    EXPECT_EQ(log.said(), (Lines{"DBG Inside Some_Helper Constructor", "DBG Inside Some_Helper Destructor"}));
    EXPECT_EQ(log.lines()[0].file, "Logged_Life_test.cpp");
}

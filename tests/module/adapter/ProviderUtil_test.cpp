#include "module/adapter/ProviderUtil.h"

#include "tests/support/Fake_Library.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

using namespace KPRV;

TEST(ProviderUtil, IsOneObject)
{
    EXPECT_NE(ProviderUtil::getProviderUtil(), nullptr);
    EXPECT_EQ(ProviderUtil::getProviderUtil(), ProviderUtil::getProviderUtil());
}

TEST(ProviderUtil, AGoodAnswerIsNeitherNullNorAnError)
{
    for (const char* text :
         {"[]", "[1]", "5", "0", "'error'", "false", "{}", "{'Error': 1}", "{'a': {'error': 1}}"})
        EXPECT_TRUE(ProviderUtil::isValidJsonResponse(json(text))) << text;
    for (const char* text : {"null", "{'error': 1}", "{'error': null}", "{'a': 1, 'error': {}}"})
        EXPECT_FALSE(ProviderUtil::isValidJsonResponse(json(text))) << text;
}

TEST(ProviderUtil, LibraryLogLinesKeepTheirRank)
{
    Log_Capture log;
    for (const int level : {1, 2, 3, 4, 5, 0, 6, -1})
        ProviderUtil::logMsg(level, "a.c", 12, "text");
    EXPECT_EQ(log.said(),
              (Lines{"DBG a.c:12 text", "INFO a.c:12 text", "WARN a.c:12 text", "ERR a.c:12 text",
                     "INFO a.c:12 text", "DBG a.c:12 text", "DBG a.c:12 text", "DBG a.c:12 text"}));
    EXPECT_EQ(log.lines()[0].file, "ProviderUtil.cpp");
}

TEST(ProviderUtil, TheHeadOfALibraryLogLineIsCutAt31Characters)
{
    Log_Capture log;
    ProviderUtil::logMsg(4, "a_name_of_27_characters_in.c", 12, "text");
    ProviderUtil::logMsg(4, "a_file_name_of_far_more_than_31_characters.c", 12, "text");
    ProviderUtil::logMsg(4, "a.c", -1, "100 %s % done");
    ProviderUtil::logMsg(4, nullptr, 0, nullptr);
    EXPECT_EQ(log.said(),
              (Lines{"ERR a_name_of_27_characters_in.c:12text", "ERR a_file_name_of_far_more_than_31text",
                     "ERR a.c:-1 100 %s % done", "ERR :0 "}));
}

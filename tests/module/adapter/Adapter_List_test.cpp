#include "module/adapter/Adapter_List.h"

#include "tests/support/Fake_Library.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

using namespace KPRV;

TEST(Adapter_List, IsAskedForWithANullRequest)
{
    Fake_Library library;
    library.answers("getAllAdaptersIndexString", json("{'indexStrings': ['a', 'b']}"));
    Json::Value response;
    const Json::Value* list = query_adapter_list(LOG_HERE, response);
    ASSERT_NE(list, nullptr);
    EXPECT_EQ(*list, json("['a', 'b']"));
    EXPECT_EQ(library.told(), Lines{"getAllAdaptersIndexString null"});
}

TEST(Adapter_List, ABadAnswerIsToldAsTheCallersLine)
{
    Fake_Library library;
    Log_Capture log;
    Json::Value response;
    for (const char* answer :
         {"null", "{}", "[]", "5", "{'indexStrings': 5}", "{'indexStrings': ['a'], 'error': 0}"}) {
        library.answers("getAllAdaptersIndexString", json(answer));
        EXPECT_EQ(query_adapter_list(LOG_HERE, response), nullptr) << answer;
    }
    EXPECT_EQ(log.said(), Lines(6, "ERR libGetAllAdaptersIndexString returns NULL."));
    EXPECT_EQ(log.lines()[0].file, "Adapter_List_test.cpp");

    library.answers("getAllAdaptersIndexString", json("{'indexStrings': null}"));
    EXPECT_NE(query_adapter_list(LOG_HERE, response), nullptr);
}

TEST(Adapter_List, TheLibrarySExceptionsPass)
{
    Fake_Library library;
    library.throws("getAllAdaptersIndexString", HbaAgentError{1, "x"});
    Json::Value response;
    EXPECT_THROW(query_adapter_list(LOG_HERE, response), HbaAgentError);
}

TEST(Adapter_List, AnAddressThatIsNoTextIsEmpty)
{
    Log_Capture log;
    const Json::Value list = json("['a', 5]");
    EXPECT_TRUE(adapter_address(LOG_HERE, list, 0) == "a");
    EXPECT_TRUE(adapter_address(LOG_HERE, list, 1) == "");
    EXPECT_EQ(log.said(),
              Lines{"ERR libGetAllAdaptersIndexString got std exception: Type is not convertible to string"});
}

#include "module/adapter/Adapter_List.h"

#include "tests/support/Fake_Library.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

using namespace KPRV;

TEST(Adapter_List, is_asked_for_with_a_null_request)
{
    Fake_Library library;
    library.answers("getAllAdaptersIndexString", json("{'indexStrings': ['a', 'b']}"));
    Json::Value response;
    const Json::Value* list = query_adapter_list(LOG_HERE, response);
    ASSERT_NE(list, nullptr);
    EXPECT_EQ(*list, json("['a', 'b']"));
    EXPECT_EQ(library.told(), Lines{"getAllAdaptersIndexString null"});
}

TEST(Adapter_List, a_bad_answer_is_told_as_the_callers_line)
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

TEST(Adapter_List, the_library_s_exceptions_pass)
{
    Fake_Library library;
    library.throws("getAllAdaptersIndexString", HbaAgentError{1, "x"});
    Json::Value response;
    EXPECT_THROW(query_adapter_list(LOG_HERE, response), HbaAgentError);
}

TEST(Adapter_List, an_address_that_is_no_text_is_empty)
{
    Log_Capture log;
    const Json::Value list = json("['a', 5]");
    EXPECT_TRUE(adapter_address(LOG_HERE, list, 0) == "a");
    EXPECT_TRUE(adapter_address(LOG_HERE, list, 1) == "");
    EXPECT_EQ(log.said(),
              Lines{"ERR libGetAllAdaptersIndexString got std exception: Type is not convertible to string"});
}

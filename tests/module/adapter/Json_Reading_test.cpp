#include "module/adapter/Json_Reading.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Small_Stack.h"

#include <gtest/gtest.h>

namespace KPRV {
namespace {

/// What is read, in one line; "refused" if nothing is.
std::string read(const std::string& text)
{
    Json::Value value;
    std::string errors;
    if (read_json(text, value, errors))
        return compact(value);
    EXPECT_NE("", errors) << text;
    return "refused";
}

bool is_too_deep(std::string_view text)
{
    Json::Value value;
    std::string errors;
    return !read_json(text, value, errors) && errors == "nested deeper than 256 levels";
}

std::string nested(unsigned levels, const std::string& open = "[", const std::string& close = "]")
{
    std::string text;
    for (unsigned i = 0; i < levels; i++)
        text += open;
    for (unsigned i = 0; i < levels; i++)
        text += close;
    return text;
}

TEST(Json_Reading, AnyValueIsARoot)
{
    EXPECT_EQ(R"({"a":[1,"two"]})", read(R"({"a": [1, "two"]})"));
    EXPECT_EQ("[1]", read("[1]"));
    EXPECT_EQ("42", read("42"));
    EXPECT_EQ("null", read("null"));
    EXPECT_EQ(R"("text")", read(R"("text")"));
}

TEST(Json_Reading, CommentsAreAllowedAndWhatFollowsIsIgnored)
{
    Json::Value value;
    std::string errors;
    EXPECT_TRUE(read_json("/* one */ { // two\n \"a\": 1 }", value, errors));
    EXPECT_EQ(1, value["a"].asInt());
    EXPECT_EQ("1", read("1 and more"));
}

TEST(Json_Reading, WhatDoesNotParseIsRefused)
{
    for (const char* text : {"", " ", "{", "[1", "{\"a\" 1}", "{a: 1}", "nul", "\"open", "'single'",
                             "/* open", "/", "}", "]]]]"})
        EXPECT_EQ("refused", read(text)) << text;
}

TEST(Json_Reading, DeepTextsAreRefusedBeforeTheyAreRead)
{
    EXPECT_EQ(nested(256), read(nested(256)));
    EXPECT_EQ("refused", read(nested(257)));
    EXPECT_EQ("refused", read(nested(1000000)));
    EXPECT_EQ("refused", read(nested(1000000, "{\"a\":", "}")));
    EXPECT_EQ("refused", read(std::string(1000000, '[')));
}

TEST(Json_Reading, OnlyBracketsOfTheTextCount)
{
    const std::string many(300, '[');
    EXPECT_EQ("\"" + many + "\"", read("\"" + many + "\""));
    EXPECT_EQ(R"(["\")" + many + "\"]", read(R"(["\")" + many + "\"]"));
    // Comments stay with the value that they stand at.
    EXPECT_EQ("/*" + many + "*/1", read("/*" + many + "*/1"));
    EXPECT_NE("refused", read("//" + many + "\n1"));
}

TEST(Json_Reading, NothingHidesDepth)
{
    const std::string deep = nested(100000);
    // Neither quotes in comments nor closing brackets without an opening one.
    EXPECT_TRUE(is_too_deep("/* \" */" + deep));
    EXPECT_TRUE(is_too_deep("// \"\n" + deep));
    EXPECT_TRUE(is_too_deep("// \"\r" + deep));
    EXPECT_TRUE(is_too_deep("/\"" + deep));
    EXPECT_TRUE(is_too_deep(std::string(100000, ']') + deep));
    EXPECT_TRUE(is_too_deep("[\"\\\\\", " + deep + "]"));
    // One level less than too many, behind each of them.
    for (const char* before : {"/* \" */", "// \"\n", "// \"\r"}) {
        EXPECT_TRUE(is_too_deep(before + nested(257)));
        EXPECT_FALSE(is_too_deep(before + nested(256)));
    }
    // What lies behind the end is no part of the text.
    const std::string behind_a_blank = " " + deep;
    EXPECT_FALSE(is_too_deep(std::string_view(behind_a_blank).substr(0, 257)));
    EXPECT_TRUE(is_too_deep(std::string_view(behind_a_blank).substr(0, 258)));
    // What is open to the end hides what is not read either.
    EXPECT_FALSE(is_too_deep("/* " + nested(257)));
    EXPECT_FALSE(is_too_deep("// " + nested(257)));
}

TEST(Json_Reading, TheDeepestTextFitsTheSmallestStack)
{
    std::string answer;
    on_small_stack([&answer] {
        answer = read(nested(256, "{\"a\":[", "]}").substr(0, 256 * 3));
        answer += read(nested(128, "{\"a\":[", "]}"));
    });
    EXPECT_EQ("refused" + nested(128, "{\"a\":[", "]}"), answer);
}

} // namespace
} // namespace KPRV

#include "broker/values/Path_Parser.h"
#include "broker/values/Value_Text.h"

#include <gtest/gtest.h>

namespace KPRV::broker {
namespace {

TEST(Path_Parser, ReadsAllKindsOfKeys)
{
    Path_Error error;
    auto path = parse_path(
        R"(root/kaldera:C_1.Text="a \"b\" \\ \x0041",Big=18446744073709551615,Low=-3,Yes=TRUE)", error);
    ASSERT_TRUE(path) << error.column << error.expected;
    EXPECT_EQ("root/kaldera", path->name_space);
    EXPECT_EQ("C_1", path->class_name);
    EXPECT_EQ("a \"b\" \\ A", path->key("text")->as_text());
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_uint64, ~std::uint64_t(0)), *path->key("Big"));
    EXPECT_EQ(Plain_Value::signed_number(CMPI_sint64, -3), *path->key("Low"));
    EXPECT_EQ(Plain_Value::boolean(true), *path->key("Yes"));
}

TEST(Path_Parser, ReadsWhatIsWritten)
{
    Path_Error error;
    for (const char* text : {R"(C)", R"(ns:C)", R"(C.K="a\\b\"c\n",N=5)", R"(C.K="\x0001\x007F\x0080\x009B")",
                             R"(C.R="ns:D.K=\"x:y.z=1\"")"}) {
        auto path = parse_path(text, error);
        ASSERT_TRUE(path) << text;
        EXPECT_EQ(text, path_text(*path));
    }
}

struct Wrong
{
    const char* text;
    std::size_t column;
    const char* expected;
};

TEST(Path_Parser, SaysWhereAndWhat)
{
    const Wrong wrongs[] = {
        {"", 1, "a class name"},
        {"1C", 1, "a class name"},
        {":C", 1, "a namespace before the colon"},
        {"C K", 2, "'.' and a key, or the end"},
        {"C.", 3, "a key name"},
        {"C.K", 4, "'='"},
        {"C.K=", 5, "a quoted text, a number, true or false"},
        {"C.K=maybe", 5, "a quoted text, a number, true or false"},
        {"C.K=\"x", 7, "'\"' at the end of the text"},
        {"C.K=\"\\q\"", 7, "an escape: \\\" \\\\ \\n \\t \\r \\b \\f or \\x and four digits"},
        {"C.K=1x", 6, "',' or the end"},
        {"C.K=99999999999999999999", 5, "a number of at most 64 bits"},
        {"C.K=1,", 7, "a key name"},
        {"C.K=1,k=2", 8, "a key that has not been given before"},
    };
    for (const Wrong& wrong : wrongs) {
        Path_Error error;
        EXPECT_FALSE(parse_path(wrong.text, error)) << wrong.text;
        EXPECT_EQ(wrong.column, error.column) << wrong.text;
        EXPECT_EQ(wrong.expected, error.expected) << wrong.text;
    }
}

} // namespace
} // namespace KPRV::broker

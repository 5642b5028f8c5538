#include "module/runtime/text/formatted_text.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

namespace KPRV {

namespace {

std::string made(char* text)
{
    std::string result = text ? text : "(null)";
    free(text);
    return result;
}

} // namespace

TEST(formatted_text, IsAsLongAsItMustBe)
{
    EXPECT_EQ("", made(str_printf("%s", "")));
    EXPECT_EQ("a 7 b", made(str_printf("a %d %s", 7, "b")));
    // Around the first guess at the room, and far beyond it.
    for (const size_t length : {126u, 127u, 128u, 129u, 255u, 256u, 100000u}) {
        const std::string text(length, 'x');
        EXPECT_EQ(text, made(str_printf("%s", text.c_str()))) << length;
        EXPECT_EQ(text, string_printf("%s", text.c_str()).c_str()) << length;
    }
}

TEST(formatted_text, AsAString)
{
    EXPECT_EQ(String("7-x"), string_printf("%d-%c", 7, 'x'));
    EXPECT_TRUE(string_printf("%s", "").empty());
}

// In this locale no such character can be written.
TEST(formatted_text, WhatCannotBeConvertedIsNone)
{
    EXPECT_EQ("(null)", made(str_printf("%ls", L"\x4E2D")));
    EXPECT_TRUE(string_printf("%ls", L"\x4E2D").empty());
}

TEST(formatted_text, IsIndentedByFourBlanksALevel)
{
    char* text = nullptr;
    size_t size = 0;
    FILE* file = open_memstream(&text, &size);
    ifprintf(file, 0, "%d\n", 1);
    ifprintf(file, 1, "%s\n", "x");
    ifprintf(file, 3, "y");
    fclose(file);
    EXPECT_EQ("1\n    x\n            y", made(text));

    testing::internal::CaptureStdout();
    iprintf(2, "z%d", 1);
    fflush(stdout);
    EXPECT_EQ("        z1", testing::internal::GetCapturedStdout());
}

} // namespace KPRV

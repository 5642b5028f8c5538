#include "module/runtime/text/Buffer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <limits>
#include <new>
#include <string>

namespace KPRV {

TEST(Buffer, BeginsWithoutABlock)
{
    const Buffer x;
    EXPECT_EQ(0u, x.size());
    EXPECT_EQ(0u, x.capacity());
    EXPECT_STREQ("", x.data());
}

TEST(Buffer, RoundingRule)
{
    EXPECT_EQ(4096u, _round_up_pow_2(0));
    EXPECT_EQ(4096u, _round_up_pow_2(4096));
    EXPECT_EQ(8192u, _round_up_pow_2(4097));
    EXPECT_EQ(0xFFFFFFFFu, _round_up_pow_2(0xFFFFFFFFu));
}

TEST(Buffer, ReserveGrowsOnlyAndIsExactBeyondTheLeast)
{
    Buffer x;
    x.reserve(1);
    EXPECT_EQ(4096u, x.capacity());
    x.reserve(5000);
    EXPECT_EQ(5000u, x.capacity());
    x.reserve(10);
    EXPECT_EQ(5000u, x.capacity());
}

TEST(Buffer, AppendOfCharactersDoubles)
{
    Buffer x;
    for (int i = 0; i < 4096; i++)
        x.append('x');
    EXPECT_EQ(4096u, x.capacity());
    EXPECT_EQ(4096u, strlen(x.data()));
    x.append('y');
    EXPECT_EQ(8192u, x.capacity());
}

TEST(Buffer, InsertGrowsToThePowerAndMovesTheTail)
{
    Buffer x;
    x.append("abef");
    x.insert(2, "cd", 2);
    EXPECT_STREQ("abcdef", x.data());
    EXPECT_EQ(4096u, x.capacity());
    const std::string much(5000, 'x');
    x.insert(0, much.data(), 5000);
    EXPECT_EQ(8192u, x.capacity());
    EXPECT_EQ(much + "abcdef", x.data());
    x.insert(99999, "!", 1);
    EXPECT_EQ('!', x.data()[5006]);
}

TEST(Buffer, Remove)
{
    Buffer x;
    x.append("abcdef");
    x.remove(1, 2);
    EXPECT_STREQ("adef", x.data());
    x.remove(2, 100);
    EXPECT_STREQ("ad", x.data());
    x.remove(2, 1);
    EXPECT_STREQ("ad", x.data());
    x.clear();
    EXPECT_STREQ("", x.data());
}

TEST(Buffer, CopiesAreDeep)
{
    Buffer a;
    a.append("abc");
    Buffer b(a);
    b.append("d");
    EXPECT_STREQ("abc", a.data());
    EXPECT_STREQ("abcd", b.data());
    a = b;
    EXPECT_STREQ("abcd", a.data());
    const Buffer& self = a;
    a = self;
    EXPECT_STREQ("abcd", a.data());
    b = Buffer();
    EXPECT_STREQ("", b.data());
}

TEST(Buffer, FormatAppendsAndCounts)
{
    Buffer x;
    EXPECT_EQ(5u, x.format("%s-%d", "ab", 12));
    EXPECT_EQ(1u, x.format("%c", '!'));
    EXPECT_STREQ("ab-12!", x.data());
}

TEST(Buffer, FormatTakesTextsOfAnyLength)
{
    for (size_t n : {126, 127, 128, 129, 4095, 4096, 4097, 100000}) {
        const std::string text(n, 'x');
        Buffer x;
        x.append("<");
        EXPECT_EQ(n, x.format("%s", text.c_str()));
        x.append(">");
        EXPECT_EQ("<" + text + ">", x.data());
    }
}

TEST(Buffer, FormatOfWhatCannotBeConvertedEndsAndAppendsNothing)
{
    Buffer x;
    x.append("abc");
    const wchar_t text[] = {static_cast<wchar_t>(0x7FFFFFFF), 0};
    EXPECT_EQ(0u, x.format("%ls", text));
    EXPECT_STREQ("abc", x.data());
}

TEST(Buffer, Numbers)
{
    Buffer x;
    x.append_uint16(0);
    x.append(' ');
    x.append_uint16(65535);
    x.append(' ');
    x.append_uint32(4294967295u);
    x.append(' ');
    x.append_uint64(18446744073709551615ull);
    EXPECT_STREQ("0 65535 4294967295 18446744073709551615", x.data());
}

TEST(Buffer, WhatWouldTakeFourGigabytesIsNeverCut)
{
    Buffer x;
    x.append("abc");
    for (const uint64 size : {uint64(NPOS), uint64(NPOS) - 3, uint64(NPOS) + 1, uint64(NPOS) + 4})
        if (size <= std::numeric_limits<size_t>::max()) {
            EXPECT_THROW(x.append("abc", static_cast<size_t>(size)), std::bad_alloc);
            EXPECT_THROW(x.insert(1, "abc", static_cast<size_t>(size)), std::bad_alloc);
        }
    EXPECT_STREQ("abc", x.data());
}

TEST(Buffer, DumpIsALinePerSixteenBytes)
{
    Buffer x;
    x.append("0123456789abcdefg\x01", 18);
    testing::internal::CaptureStdout();
    x.dump();
    const std::string text = testing::internal::GetCapturedStdout();
    EXPECT_EQ(2, std::count(text.begin(), text.end(), '\n'));
    EXPECT_NE(std::string::npos, text.find("0123456789abcdef\n"));
    EXPECT_NE(std::string::npos, text.find("00000010 67 01 "));
    EXPECT_NE(std::string::npos, text.find("g.\n"));
}

} // namespace KPRV

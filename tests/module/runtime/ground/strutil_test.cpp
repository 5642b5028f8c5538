#include "module/runtime/ground/strutil.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>

namespace KPRV {

TEST(strutil, CopyIsBoundedAndTellsTheFullLength)
{
    char buffer[4];
    EXPECT_EQ(2u, KPRV::strlcpy(buffer, "ab", sizeof(buffer)));
    EXPECT_STREQ("ab", buffer);
    EXPECT_EQ(3u, KPRV::strlcpy(buffer, "abc", sizeof(buffer)));
    EXPECT_STREQ("abc", buffer);
    EXPECT_EQ(6u, KPRV::strlcpy(buffer, "uvwxyz", sizeof(buffer)));
    EXPECT_STREQ("uvw", buffer);
}

TEST(strutil, CopyIntoNothingWritesNothing)
{
    char buffer[] = "ab";
    EXPECT_EQ(3u, KPRV::strlcpy(buffer, "xyz", 0));
    EXPECT_STREQ("ab", buffer);
    EXPECT_EQ(3u, KPRV::strlcpy(buffer, "xyz", 1));
    EXPECT_STREQ("", buffer);
}

TEST(strutil, ConcatenationIsBoundedAndTellsTheFullLength)
{
    char buffer[6] = "ab";
    EXPECT_EQ(4u, KPRV::strlcat(buffer, "cd", sizeof(buffer)));
    EXPECT_STREQ("abcd", buffer);
    EXPECT_EQ(7u, KPRV::strlcat(buffer, "efg", sizeof(buffer)));
    EXPECT_STREQ("abcde", buffer);
    EXPECT_EQ(6u, KPRV::strlcat(buffer, "x", sizeof(buffer)));
    EXPECT_STREQ("abcde", buffer);
}

TEST(strutil, ConcatenationToAnUnterminatedTextLeavesIt)
{
    char buffer[] = {'a', 'b', 'c'};
    EXPECT_EQ(5u, KPRV::strlcat(buffer, "de", 3));
    EXPECT_EQ(0, memcmp(buffer, "abc", 3));
}

TEST(strutil, LowerFoldsTheLettersOfASCIIOnly)
{
    for (int i = 0; i < 256; i++)
        EXPECT_EQ(i >= 'A' && i <= 'Z' ? i - 'A' + 'a' : i, __lower[i]) << i;
}

TEST(strutil, NamesAreEqualInAnyCase)
{
    EXPECT_TRUE(name_eq("", ""));
    EXPECT_TRUE(name_eq("InstanceID", "instanceid"));
    EXPECT_TRUE(name_eq("INSTANCEID", "InstanceID"));
    EXPECT_FALSE(name_eq("InstanceID", "InstanceI"));
    EXPECT_FALSE(name_eq("InstanceI", "InstanceID"));
    EXPECT_FALSE(name_eq("InstanceID", "XnstanceID"));
    EXPECT_FALSE(name_eq("InstanceID", ""));
    // Letters beyond ASCII have no case here: these differ in one byte of Latin 1.
    EXPECT_FALSE(name_eq("Stra\xDF"
                         "e\xC4",
                         "Stra\xDF"
                         "e\xE4"));
}

TEST(strutil, NamesOfEveryLengthAreComparedToTheirEnd)
{
    const std::string lower = "kaldera_scsiprotocolendpoint", upper = "KALDERA_SCSIPROTOCOLENDPOINT";
    for (size_t n = 0; n <= lower.size(); n++) {
        const std::string a = lower.substr(0, n), b = upper.substr(0, n);
        EXPECT_TRUE(name_eq(a.c_str(), b.c_str())) << n;
        EXPECT_FALSE(name_eq(a.c_str(), (b + "x").c_str())) << n;
        EXPECT_FALSE(name_eq((a + "x").c_str(), b.c_str())) << n;
        EXPECT_FALSE(name_eq((a + "x").c_str(), (b + "y").c_str())) << n;
    }
}

TEST(strutil, FoldedEqualityEndsAtTheLengthOrTheTerminator)
{
    EXPECT_TRUE(folded_eq("abX", "ABy", 2));
    EXPECT_FALSE(folded_eq("abX", "ABy", 3));
    EXPECT_TRUE(folded_eq("ab\0x", "AB\0y", 4));
}

} // namespace KPRV

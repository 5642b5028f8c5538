#include "module/providers/Position_Index.h"

#include <gtest/gtest.h>

#include <string>

namespace KPRV {

using Positions = std::vector<uint32>;

TEST(Position_Index, FindsInTheOrderOfTheListWhateverTheCase)
{
    Position_Index index;
    index.add("20008C7C00000001", 4);
    index.add("20008c7c00000002", 5);
    index.add("20008c7C00000001", 9);
    index.add("20008c7C00000001", 11);
    index.add("20008C7C00000001", 12);
    ASSERT_NE(nullptr, index.find("20008c7c00000001"));
    EXPECT_EQ((Positions{4, 9, 11, 12}), *index.find("20008c7c00000001"));
    EXPECT_EQ(nullptr, index.find("20008c7c00000003"));
    EXPECT_EQ(nullptr, index.find("20008c7c0000000"));
}

TEST(Position_Index, FoldsLettersAlone)
{
    Position_Index index;
    index.add("@[]_", 1);
    EXPECT_EQ(nullptr, index.find("`{}_"));
    EXPECT_NE(nullptr, index.find("@[]_"));
}

TEST(Position_Index, ReadsTextsOfEveryLengthToTheirEnd)
{
    const std::string lower = "abcdefghijklmnopqrstuvwxyzabcdefghijklmnop", upper = [&] {
        std::string text = lower;
        for (char& c : text)
            c = static_cast<char>(c - 'a' + 'A');
        return text;
    }();
    Position_Index index;
    for (uint32 size = 0; size <= lower.size(); size++)
        index.add(std::string_view(lower).substr(0, size), size);
    for (uint32 size = 0; size <= upper.size(); size++) {
        ASSERT_NE(nullptr, index.find(std::string_view(upper).substr(0, size))) << size;
        EXPECT_EQ(Positions{size}, *index.find(std::string_view(upper).substr(0, size)));
    }
    EXPECT_NE(nullptr, index.find(std::string_view()));
}

TEST(Position_Index, KeepsTextsThatAreApartInWhatTheHashFolds)
{
    // The hash puts these into one place.
    Position_Index index;
    index.add("A\x1f", 1);
    index.add("A?", 2);
    EXPECT_EQ(Positions{1}, *index.find("a\x1f"));
    EXPECT_EQ(Positions{2}, *index.find("a?"));
}

} // namespace KPRV

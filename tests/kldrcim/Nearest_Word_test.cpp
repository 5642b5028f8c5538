#include "kldrcim/input/Nearest_Word.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {
namespace {

const std::vector<std::string> words = {"ei",       "ein",          "graph",  "tree",
                                        "profiles", "--properties", "--role", "--result"};

TEST(Nearest_Word, OfOneMistake)
{
    for (const auto& [written, meant] : {std::pair{"tre", "tree"},
                                         {"rtee", "tree"},
                                         {"trees", "tree"},
                                         {"trxe", "tree"},
                                         {"garph", "graph"},
                                         {"eni", "ei"},
                                         {"--propreties", "--properties"}})
        EXPECT_EQ(meant, nearest_word(written, words)) << written;
}

TEST(Nearest_Word, OfABeginning)
{
    EXPECT_EQ("profiles", nearest_word("pro", words));
    EXPECT_EQ("--properties", nearest_word("--prop", words));
}

TEST(Nearest_Word, OfWhatIsFarFromAllIsNone)
{
    for (const char* written : {"", "x", "xy", "frobnicate", "gr", "--verbose"})
        EXPECT_EQ("", nearest_word(written, words)) << written;
    EXPECT_EQ("", nearest_word("tree", {}));
}

TEST(Nearest_Word, IsSuggested)
{
    EXPECT_EQ(" (did you mean \"tree\"?)", suggestion("tre", words));
    EXPECT_EQ("", suggestion("frobnicate", words));
}

} // namespace
} // namespace KPRV::kldrcim

#include "kldrcim/walks/Text_Pool.h"

#include <gtest/gtest.h>
#include <string>

namespace KPRV::kldrcim {
namespace {

TEST(Text_Pool, TextsStayWhereverThePoolGoes)
{
    Text_Pool pool;
    std::vector<std::string_view> kept;
    // Of every size: those that fill a piece, and those that are larger than one.
    for (std::size_t i = 0; i < 2000; ++i)
        kept.push_back(pool.keep(std::string(i * 97 % 70000, static_cast<char>('a' + i % 26))));
    const Text_Pool moved = std::move(pool);
    for (std::size_t i = 0; i < kept.size(); ++i)
        EXPECT_EQ(std::string(i * 97 % 70000, static_cast<char>('a' + i % 26)), kept[i]) << i;
    EXPECT_TRUE(kept[0].empty());
}

} // namespace
} // namespace KPRV::kldrcim

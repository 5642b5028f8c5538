#include "kldrcim/server/Text_Spool.h"

#include <cstdlib>
#include <gtest/gtest.h>

namespace KPRV::kldrcim {

namespace {

std::string text(int number, std::size_t size = 10)
{
    std::string result = std::to_string(number) + ":";
    result.resize(size, 'x');
    return result;
}

} // namespace

TEST(Text_Spool, GivesTheOldestFirst)
{
    Text_Spool spool(100);
    for (int i = 0; i < 50; ++i)
        spool.put(text(i));
    EXPECT_EQ(50U, spool.size());
    EXPECT_EQ(400, spool.file_bytes());
    for (int i = 0; i < 50; ++i)
        EXPECT_EQ(text(i), spool.take());
    EXPECT_EQ(0U, spool.size());
}

TEST(Text_Spool, StaysInOrderWhileBothGoOn)
{
    Text_Spool spool(100);
    int put = 0, taken = 0;
    for (; put < 30; ++put)
        spool.put(text(put));
    // There is room in memory again, but the file holds older ones.
    for (; taken < 15; ++taken)
        EXPECT_EQ(text(taken), spool.take());
    for (; put < 40; ++put)
        spool.put(text(put));
    for (; taken < 40; ++taken)
        EXPECT_EQ(text(taken), spool.take());
    spool.put(text(put));
    EXPECT_EQ(text(put), spool.take());
}

TEST(Text_Spool, LeavesNothingInAFileThatWasRead)
{
    Text_Spool spool(0);
    for (int round = 0; round < 3; ++round) {
        spool.put(text(round, 1000));
        spool.put("");
        EXPECT_EQ(1000, spool.file_bytes());
        EXPECT_EQ(text(round, 1000), spool.take());
        EXPECT_EQ("", spool.take());
        EXPECT_EQ(0, spool.file_bytes());
    }
}

TEST(Text_Spool, StaysInMemoryWhereThereIsNoFile)
{
    const char* const before = std::getenv("TMPDIR");
    const std::string folder = before ? before : "";
    setenv("TMPDIR", "/proc/nowhere", 1);
    Text_Spool spool(0);
    spool.put(text(1));
    spool.put(text(2));
    before ? setenv("TMPDIR", folder.c_str(), 1) : unsetenv("TMPDIR");
    EXPECT_EQ(0, spool.file_bytes());
    EXPECT_EQ(text(1), spool.take());
    EXPECT_EQ(text(2), spool.take());
}

} // namespace KPRV::kldrcim

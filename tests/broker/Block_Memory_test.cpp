#include "broker/Block_Memory.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <deque>
#include <filesystem>
#include <gtest/gtest.h>
#include <unistd.h>

namespace KPRV::broker {
namespace {

constexpr std::size_t size = Block_Memory::BLOCK_SIZE;

class Block_Memory_Test : public testing::Test
{
protected:
    void SetUp() override
    {
        std::filesystem::create_directory(folder);
        setenv("TMPDIR", folder, 1);
    }
    void TearDown() override
    {
        unsetenv("TMPDIR");
        // Nothing is left, and nothing was ever to be seen.
        EXPECT_TRUE(std::filesystem::is_empty(folder));
        std::filesystem::remove(folder);
    }

    /// Each with a number of its own all over it.
    void take(Block_Memory& memory, std::size_t count)
    {
        for (std::size_t i = 0; i < count; ++i) {
            Block_Memory::Block& block = blocks.emplace_back();
            memory.take(block);
            EXPECT_EQ(0u, reinterpret_cast<std::uintptr_t>(block.begin) % size);
            std::fill_n(block.begin, size, static_cast<char>(i));
        }
    }
    void expect_whole(Block_Memory& memory)
    {
        for (std::size_t i = 0; i < blocks.size(); ++i) {
            memory.touch(blocks[i]);
            EXPECT_EQ(size, std::count(blocks[i].begin, blocks[i].begin + size, static_cast<char>(i))) << i;
        }
    }
    void give_all(Block_Memory& memory)
    {
        for (Block_Memory::Block& block : blocks)
            memory.give(block);
        blocks.clear();
    }

    static std::size_t resident()
    {
        std::size_t total = 0, pages = 0;
        std::FILE* const file = std::fopen("/proc/self/statm", "r");
        EXPECT_EQ(2, std::fscanf(file, "%zu %zu", &total, &pages));
        std::fclose(file);
        return pages * static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
    }

    static constexpr const char* folder = "block_memory";
    std::deque<Block_Memory::Block> blocks;
};

TEST_F(Block_Memory_Test, WithoutABoundAllLieInMemory)
{
    Block_Memory memory(0);
    take(memory, 20);
    EXPECT_EQ(0u, memory.in_file());
    expect_whole(memory);
    give_all(memory);
}

TEST_F(Block_Memory_Test, BeyondTheBoundTheyLieInAFileAndFewOfThemAreHere)
{
    Block_Memory memory(4 * size);
    [[maybe_unused]] const std::size_t before = resident();
    take(memory, 80);
    EXPECT_EQ(76 * size, memory.in_file());
    EXPECT_EQ(8, std::ranges::count_if(blocks, [](const auto& block) { return block.is_here.load(); }));
#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
    EXPECT_LT(resident(), before + 16 * size);
    expect_whole(memory);
    EXPECT_LT(resident(), before + 16 * size);
#endif
    expect_whole(memory);
    EXPECT_EQ(8, std::ranges::count_if(blocks, [](const auto& block) { return block.is_here.load(); }));
    give_all(memory);
    EXPECT_EQ(0u, memory.in_file());
}

TEST_F(Block_Memory_Test, AGivenPlaceInTheFileIsTakenAgain)
{
    Block_Memory memory(size);
    take(memory, 10);
    for (int i = 0; i < 100; ++i) {
        memory.give(blocks.back());
        blocks.pop_back();
        EXPECT_EQ(8 * size, memory.in_file());
        memory.take(blocks.emplace_back());
        // What stood there before is gone.
        EXPECT_EQ(size, std::count(blocks.back().begin, blocks.back().begin + size, '\0'));
        std::fill_n(blocks.back().begin, size, '\x9');
    }
    EXPECT_EQ(9 * size, memory.in_file());
    expect_whole(memory);
    give_all(memory);
}

TEST_F(Block_Memory_Test, WithoutAFolderAllLieInMemory)
{
    setenv("TMPDIR", "block_memory/none", 1);
    Block_Memory memory(size);
    take(memory, 5);
    EXPECT_EQ(0u, memory.in_file());
    expect_whole(memory);
    give_all(memory);
}

} // namespace
} // namespace KPRV::broker

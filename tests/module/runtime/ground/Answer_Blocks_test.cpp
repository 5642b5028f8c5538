#include "module/runtime/ground/Answer_Blocks.h"

#include "module/runtime/ground/String.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <limits>
#include <new>
#include <string>
#include <thread>
#include <vector>

using namespace KPRV;

namespace {

/// A block full of a byte, which is looked at before it is given back.
struct Filled
{
    unsigned char* block;
    size_t size;
    unsigned char with;

    static Filled make(size_t size, size_t number)
    {
        const auto with = static_cast<unsigned char>(number);
        return {static_cast<unsigned char*>(memset(take_block(size), with, size)), size, with};
    }
    void end() const
    {
        EXPECT_EQ(std::string(size, char(with)), std::string(reinterpret_cast<char*>(block), size));
        give_block(block);
    }
};

/// More than several pieces, of all sizes that pieces are cut into and of some that stand for themselves.
std::vector<Filled> many()
{
    std::vector<Filled> blocks;
    for (size_t i = 0; i < 500; i++)
        blocks.push_back(Filled::make(i * 7 % 2100, i));
    return blocks;
}

void end_all(const std::vector<Filled>& blocks)
{
    for (const Filled& each : blocks)
        each.end();
}

size_t distance(const void* a, const void* b)
{
    return size_t(static_cast<const char*>(b) - static_cast<const char*>(a));
}

} // namespace

TEST(Answer_Blocks, BlocksAreApartAndAligned)
{
    const auto look = [] {
        const std::vector<Filled> blocks = many();
        for (const Filled& each : blocks)
            EXPECT_EQ(0u, reinterpret_cast<uintptr_t>(each.block) % sizeof(void*));
        end_all(blocks);
    };
    look();
    const Answer_Blocks answer;
    look();
    look();
}

TEST(Answer_Blocks, BlocksOfAnAnswerStandOneBehindTheOther)
{
    const Answer_Blocks answer;
    void* const first = take_block(1);
    void* const second = take_block(24);
    void* const third = take_block(24);
    EXPECT_EQ(2 * sizeof(void*), distance(first, second));
    EXPECT_EQ(24 + sizeof(void*), distance(second, third));
    give_block(second);
    give_block(first);
    give_block(third);
}

TEST(Answer_Blocks, BlocksOutliveTheAnswer)
{
    const auto blocks = [] {
        const Answer_Blocks answer;
        return many();
    }();
    end_all(blocks);
}

TEST(Answer_Blocks, AnyThreadMayGiveThemBack)
{
    std::vector<Filled> before, within;
    {
        const Answer_Blocks answer;
        before = many();
        std::jthread other([&] { end_all(before); });
        within = many();
    }
    std::jthread([&] { end_all(within); }).join();
}

TEST(Answer_Blocks, AnotherThreadHasNoneOfThisAnswer)
{
    const Answer_Blocks answer;
    void* const here = take_block(8);
    std::jthread([here] {
        void* const there = take_block(8);
        EXPECT_NE(2 * sizeof(void*), distance(here, there));
        give_block(there);
    }).join();
    give_block(here);
}

TEST(Answer_Blocks, AnAnswerWithinAnAnswerIsPartOfIt)
{
    const Answer_Blocks answer;
    void* const first = take_block(8);
    void* second;
    {
        const Answer_Blocks inner;
        second = take_block(8);
    }
    void* const third = take_block(8);
    EXPECT_EQ(sizeof(void*) + 8, distance(first, second));
    EXPECT_EQ(sizeof(void*) + 8, distance(second, third));
    for (void* block : {first, second, third})
        give_block(block);
}

TEST(Answer_Blocks, ABlockKeepsWhatItHoldsWhenItsSizeChanges)
{
    const auto look = [] {
        void* block = memcpy(take_block(5), "text", 5);
        size_t former = 5;
        for (const size_t size : {size_t(40), size_t(5000), size_t(9000), size_t(5)}) {
            block = resize_block(block, former, size);
            former = size;
            EXPECT_STREQ("text", static_cast<char*>(block));
        }
        give_block(block);
    };
    look();
    const Answer_Blocks answer;
    look();
}

TEST(Answer_Blocks, WhatNoMemoryHoldsIsRefusedAndNothingIsLost)
{
    constexpr size_t MOST = std::numeric_limits<size_t>::max();
    for (const size_t size : {MOST, MOST - 1}) {
        EXPECT_THROW(take_block(size), std::bad_alloc);
        const Answer_Blocks answer;
        EXPECT_THROW(take_block(size), std::bad_alloc);
        void* const block = memcpy(take_block(5), "text", 5);
        EXPECT_THROW(resize_block(block, 5, size), std::bad_alloc);
        EXPECT_STREQ("text", static_cast<char*>(block));
        give_block(block);
    }
}

TEST(Answer_Blocks, TextsOfAnAnswerAreTextsLikeOthers)
{
    String kept("outside");
    {
        const Answer_Blocks answer;
        const String made("made within");
        kept = made;
        String grown(made);
        for (int i = 0; i < 5000; i++)
            grown.append('x');
        EXPECT_EQ(5000u + made.size(), grown.size());
    }
    kept.append(", used without");
    EXPECT_STREQ("made within, used without", kept.c_str());
}

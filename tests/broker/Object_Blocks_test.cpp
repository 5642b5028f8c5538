#include "broker/Object_Blocks.h"

#include "broker/Object.h"

#include <cstring>
#include <gtest/gtest.h>
#include <thread>

namespace KPRV::broker {
namespace {

/// Where the part of an object begins that providers see.
const void* seen(const void* place)
{
    return static_cast<const char*>(place) + sizeof(Object);
}

TEST(Object_Blocks, AnAddressIsKnownBetweenAnnouncementAndEnd)
{
    Object_Blocks blocks(0);
    void* const place = blocks.take_for_object(136);
    EXPECT_EQ(nullptr, Object_Blocks::find(seen(place)));
    EXPECT_EQ(nullptr, blocks.any());
    blocks.announce(place);
    EXPECT_EQ(place, Object_Blocks::find(seen(place)));
    EXPECT_EQ(place, blocks.any());
    for (std::size_t offset = 0; offset < 400; ++offset)
        EXPECT_EQ(offset == sizeof(Object) ? place : nullptr,
                  Object_Blocks::find(static_cast<char*>(place) + offset));
    blocks.give_object(place);
    EXPECT_EQ(nullptr, Object_Blocks::find(seen(place)));
    EXPECT_EQ(nullptr, blocks.any());
    // And what lies in no block at all.
    int local = 0;
    EXPECT_EQ(nullptr, Object_Blocks::find(&local));
    EXPECT_EQ(nullptr, Object_Blocks::find(reinterpret_cast<void*>(16)));
}

TEST(Object_Blocks, WhatObjectsHoldHasNoAddressThatIsKnown)
{
    Object_Blocks blocks(0);
    for (const std::size_t size : {1u, 16u, 512u, 513u, 8192u, 8193u, 100000u}) {
        char* const bytes = blocks.take_bytes(size);
        std::memset(bytes, 'x', size);
        EXPECT_EQ(nullptr, Object_Blocks::find(bytes));
        blocks.give_bytes(bytes, size);
    }
}

TEST(Object_Blocks, NoTwoPlacesOverlap)
{
    // Few in memory, so that many blocks leave and come back.
    Object_Blocks blocks(std::size_t(1) << 18);
    struct Piece
    {
        char* begin;
        std::size_t size;
        char sign;
    };
    std::vector<Piece> pieces;
    const auto add = [&](std::size_t i) {
        const std::size_t size = 1 + i * 37 % 3000;
        Piece piece = {blocks.take_bytes(size), size, static_cast<char>(i)};
        std::memset(piece.begin, piece.sign, size);
        pieces.push_back(piece);
    };
    for (std::size_t i = 0; i < 5000; ++i) {
        add(i);
        if (i % 3 == 0) {
            Piece& piece = pieces[i * 7 % pieces.size()];
            blocks.give_bytes(piece.begin, piece.size);
            piece = pieces.back();
            pieces.pop_back();
        }
    }
    for (const Piece& piece : pieces) {
        EXPECT_EQ(piece.size, std::count(piece.begin, piece.begin + piece.size, piece.sign));
        blocks.give_bytes(piece.begin, piece.size);
    }
    EXPECT_EQ(0u, blocks.memory().in_file() / (std::size_t(1) << 25)) << "what is empty goes back";
}

TEST(Object_Blocks, ManyThreadsFindTheirOwn)
{
    Object_Blocks blocks(std::size_t(1) << 18);
    std::vector<std::thread> threads;
    for (std::size_t number = 0; number < 4; ++number)
        threads.emplace_back([&, number] {
            std::vector<void*> mine;
            for (std::size_t i = 0; i < 3000; ++i) {
                mine.push_back(blocks.take_for_object(112 + 16 * number));
                blocks.announce(mine.back());
                EXPECT_EQ(mine[i / 2], Object_Blocks::find(seen(mine[i / 2])));
            }
            for (void* const place : mine) {
                blocks.give_object(place);
                EXPECT_EQ(nullptr, Object_Blocks::find(seen(place)));
            }
        });
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(nullptr, blocks.any());
}

} // namespace
} // namespace KPRV::broker

#include "module/runtime/ground/String.h"

#include <gtest/gtest.h>

#include <limits>
#include <new>
#include <string>
#include <thread>
#include <vector>

namespace KPRV {

namespace {

/// The shared block behind a handle.
const String_Rep* rep_of(const String& x)
{
    return *reinterpret_cast<const String_Rep* const*>(&x);
}

std::string letters(size_t n)
{
    return std::string(n, 'x');
}

} // namespace

TEST(String, EmptyOnesShareTheOneRepUncounted)
{
    const String a;
    const String b("");
    const String c("abc", size_t(0));
    const String d(a);
    const String e("", "", "");
    for (const String* x : {&a, &b, &c, &d, &e}) {
        EXPECT_EQ(&String::_empty, rep_of(*x));
        EXPECT_STREQ("", x->c_str());
        EXPECT_TRUE(x->empty());
    }
    EXPECT_EQ(2, String::_empty.refs);
    EXPECT_EQ(0u, String::_empty.size);
    EXPECT_EQ(0u, String::_empty.cap);
}

TEST(String, CapacityRule)
{
    EXPECT_EQ(32u, _next_pow_2(0));
    EXPECT_EQ(32u, _next_pow_2(31));
    EXPECT_EQ(32u, _next_pow_2(32));
    EXPECT_EQ(64u, _next_pow_2(33));
    EXPECT_EQ(64u, _next_pow_2(64));
    EXPECT_EQ(128u, _next_pow_2(65));
    EXPECT_EQ(0x80000000u, _next_pow_2(0x7FFFFFFFu));
    EXPECT_EQ(0x80000000u, _next_pow_2(0x80000000u));
    EXPECT_EQ(0x80000001u, _next_pow_2(0x80000001u));
}

TEST(String, ConstructionTakesItsCapacityFromTheRule)
{
    EXPECT_EQ(32u, String("a").capacity());
    EXPECT_EQ(32u, String(letters(32).c_str()).capacity());
    EXPECT_EQ(64u, String(letters(33).c_str()).capacity());
}

TEST(String, ConstructionOfPartsAndLengths)
{
    EXPECT_STREQ("abc", String("abcdef", 3).c_str());
    EXPECT_STREQ("abcd", String("ab", "cd").c_str());
    EXPECT_STREQ("abcdef", String("ab", "cd", "ef").c_str());
    EXPECT_STREQ("cd", String("", "cd").c_str());
    EXPECT_EQ(6u, String("ab", "cd", "ef").size());
    EXPECT_STREQ("abcd", (String("ab") + String("cd")).c_str());
}

TEST(String, ANullTextIsEmpty)
{
    const char* none = nullptr;
    EXPECT_TRUE(String(none).empty());
    String x("abc");
    x.append(none);
    EXPECT_STREQ("abc", x.c_str());
    EXPECT_FALSE(x.equal(none));
    EXPECT_FALSE(x.equali(none));
    x.assign(none);
    EXPECT_TRUE(x.empty());
    EXPECT_TRUE(x.equal(none));
}

TEST(String, EmbeddedZeroBytesCount)
{
    const String x("a\0b", 3);
    EXPECT_EQ(3u, x.size());
    EXPECT_TRUE(x.equal("a\0b", 3));
    EXPECT_FALSE(x.equal("a"));
}

TEST(String, CopiesShareAndAreCounted)
{
    String a("abc");
    EXPECT_EQ(1, rep_of(a)->refs);
    {
        const String b(a);
        String c;
        c = a;
        EXPECT_EQ(rep_of(a), rep_of(b));
        EXPECT_EQ(rep_of(a), rep_of(c));
        EXPECT_EQ(3, rep_of(a)->refs);
    }
    EXPECT_EQ(1, rep_of(a)->refs);
    const String& self = a;
    a = self;
    EXPECT_EQ(1, rep_of(a)->refs);
    EXPECT_STREQ("abc", a.c_str());
}

TEST(String, MutatorsLeaveOtherHandlesAlone)
{
    const String original("abcdef");
    using Mutator = void (*)(String&);
    const Mutator mutators[] = {
        [](String& x) { x.append('g'); },         [](String& x) { x.append("gh"); },
        [](String& x) { x.set(0, 'X'); },         [](String& x) { x.remove(1, 2); },
        [](String& x) { x.assign("other"); },     [](String& x) { x.clear(); },
        [](String& x) { x.reserve(100); },        [](String& x) { x.reserve(0); },
        [](String& x) { x.append(String("g")); },
    };
    for (Mutator mutate : mutators) {
        String x(original);
        mutate(x);
        EXPECT_NE(rep_of(original), rep_of(x));
        EXPECT_STREQ("abcdef", original.c_str());
        EXPECT_EQ(1, rep_of(original)->refs);
    }
}

TEST(String, RemovingNothingCopiesNothing)
{
    String empty;
    empty.remove(0, 1);
    EXPECT_EQ(&String::_empty, rep_of(empty));
    const String a("abc");
    String b(a);
    b.remove(3, 1);
    b.remove(4, 1);
    b.remove(0, 0);
    EXPECT_EQ(rep_of(a), rep_of(b));
}

TEST(String, WhatFitsExactlyIsAddedInPlace)
{
    String x("a");
    const String_Rep* const rep = rep_of(x);
    x.reserve(32);
    x.append(letters(31).c_str());
    EXPECT_EQ(rep, rep_of(x));
    EXPECT_EQ(32u, x.size());
    x.append("b");
    EXPECT_NE(rep, rep_of(x));
}

TEST(String, AppendOfACharacterGrows)
{
    String x;
    x.append('x');
    EXPECT_EQ(32u, x.capacity());
    EXPECT_STREQ("x", x.c_str());
    while (x.size() < 32)
        x.append('x');
    EXPECT_EQ(32u, x.capacity());
    x.append('y');
    EXPECT_EQ(64u, x.capacity());
    EXPECT_EQ(letters(32) + "y", x.c_str());
}

TEST(String, AppendOfACharacterToASharedTextDoublesItsCapacity)
{
    const String a("abc");
    String b(a);
    b.append('d');
    EXPECT_EQ(64u, b.capacity());
    EXPECT_STREQ("abcd", b.c_str());
}

TEST(String, AppendOfATextGrowsToTheNextPower)
{
    String x("abc");
    x.append(letters(29).c_str());
    EXPECT_EQ(32u, x.capacity());
    x.append("z", 1);
    EXPECT_EQ(64u, x.capacity());
    EXPECT_EQ(33u, x.size());
    x.append(String(letters(100).c_str()));
    EXPECT_EQ(256u, x.capacity());
    EXPECT_EQ(133u, x.size());
    x.append("", 0);
    EXPECT_EQ(133u, x.size());
}

TEST(String, AppendOfNothingToTheEmptyStringStaysTheOneRep)
{
    String x;
    x.append("");
    x.append(String());
    EXPECT_EQ(&String::_empty, rep_of(x));
}

TEST(String, AStringMayBeGivenItsOwnText)
{
    String x("abcdef");
    x.append(x);
    EXPECT_STREQ("abcdefabcdef", x.c_str());
    for (int i = 0; i < 4; i++)
        x.append(x.c_str() + 6);
    EXPECT_EQ(12u + 6 + 12 + 24 + 48, x.size());
    x.assign(x.c_str() + 3, 4);
    EXPECT_STREQ("defa", x.c_str());
    String shared(x);
    shared.assign(shared.c_str() + 1);
    EXPECT_STREQ("efa", shared.c_str());
    EXPECT_STREQ("defa", x.c_str());
}

TEST(String, ReserveKeepsTheTextAndTakesTheRule)
{
    String x("abc");
    const String_Rep* before = rep_of(x);
    x.reserve(32);
    EXPECT_EQ(before, rep_of(x));
    x.reserve(33);
    EXPECT_EQ(64u, x.capacity());
    EXPECT_STREQ("abc", x.c_str());
    String none;
    none.reserve(0);
    EXPECT_EQ(32u, none.capacity());
    EXPECT_STREQ("", none.c_str());
}

TEST(String, ClearKeepsAnOwnRepAndLeavesASharedOne)
{
    String own("abc");
    const String_Rep* before = rep_of(own);
    own.clear();
    EXPECT_EQ(before, rep_of(own));
    EXPECT_EQ(32u, own.capacity());
    EXPECT_STREQ("", own.c_str());

    const String a("abc");
    String b(a);
    b.clear();
    EXPECT_EQ(&String::_empty, rep_of(b));
    EXPECT_EQ(1, rep_of(a)->refs);

    String none;
    none.clear();
    EXPECT_EQ(&String::_empty, rep_of(none));
}

TEST(String, Remove)
{
    String x("abcdef");
    x.remove(1, 2);
    EXPECT_STREQ("adef", x.c_str());
    x.remove(2);
    EXPECT_STREQ("ad", x.c_str());
    x.remove(1, 100);
    EXPECT_STREQ("a", x.c_str());
    x.remove(1);
    x.remove(7, 1);
    EXPECT_STREQ("a", x.c_str());
    x.remove(0, NPOS);
    EXPECT_TRUE(x.empty());
}

TEST(String, SubstrAndSet)
{
    String x("abcdef");
    EXPECT_STREQ("cd", x.substr(2, 2).c_str());
    EXPECT_STREQ("cdef", x.substr(2).c_str());
    EXPECT_STREQ("cdef", x.substr(2, 100).c_str());
    EXPECT_TRUE(x.substr(6).empty());
    EXPECT_TRUE(x.substr(100, 2).empty());
    x.set(2, 'X');
    EXPECT_STREQ("abXdef", x.c_str());
    EXPECT_EQ('X', x[2]);
}

TEST(String, Find)
{
    const String x("abcabc");
    EXPECT_EQ(1u, x.find('b'));
    EXPECT_EQ(4u, x.find('b', 2));
    EXPECT_EQ(4u, x.find('b', 4));
    EXPECT_EQ(NPOS, x.find('b', 5));
    EXPECT_EQ(NPOS, x.find('b', 100));
    EXPECT_EQ(NPOS, x.find('z'));
    EXPECT_EQ(2u, x.find("ca"));
    EXPECT_EQ(NPOS, x.find("cc"));
    EXPECT_EQ(0u, x.find(""));
}

TEST(String, Equality)
{
    const String x("abc");
    EXPECT_TRUE(x.equal(String("abc")));
    EXPECT_FALSE(x.equal(String("abd")));
    EXPECT_FALSE(x.equal(String("abcd")));
    EXPECT_TRUE(x.equal("abc"));
    EXPECT_FALSE(x.equal("ab"));
    EXPECT_TRUE(x.equal("abcd", 3));
    EXPECT_FALSE(x.equal("abcd", 4));
    EXPECT_TRUE(x.equal(1, "bc", 2));
    EXPECT_TRUE(x.equal(1, "bX", 1));
    EXPECT_FALSE(x.equal(1, "bd", 2));
    EXPECT_FALSE(x.equal(2, "cd", 2));
    EXPECT_TRUE(x.equal(3, "", 0));
    EXPECT_FALSE(x.equal(4, "", 0));
    EXPECT_TRUE(x == "abc");
    EXPECT_TRUE(x == String("abc"));
    EXPECT_FALSE(x == "ABC");
}

TEST(String, EqualityThatFoldsCase)
{
    const String x("abC[");
    EXPECT_TRUE(x.equali("ABc["));
    EXPECT_TRUE(x.equali(String("aBc[")));
    EXPECT_FALSE(x.equali("ABc{"));
    EXPECT_FALSE(x.equali("ABc"));
    EXPECT_FALSE(x.equali(String("ABc[x")));
}

TEST(String, WhatWouldTakeFourGigabytesIsNeverCut)
{
    String x("abc");
    const String shared(x);
    // The last two are sizes on 64 bits only.
    for (const uint64 wide : {uint64(NPOS), uint64(NPOS) + 1, uint64(NPOS) + 4}) {
        if (wide > std::numeric_limits<size_t>::max())
            continue;
        const size_t size = static_cast<size_t>(wide);
        EXPECT_THROW(String("abc", size), std::bad_alloc);
        EXPECT_THROW(x.assign("abc", size), std::bad_alloc);
        EXPECT_THROW(x.append("abc", size), std::bad_alloc);
        EXPECT_THROW(String().append("abc", size), std::bad_alloc);
    }
    EXPECT_THROW(x.append("abc", NPOS - 3), std::bad_alloc) << "the sum is what counts";
    EXPECT_THROW(x.reserve(NPOS), std::bad_alloc);
    EXPECT_STREQ("abc", x.c_str());
    EXPECT_EQ(rep_of(x), rep_of(shared));
}

TEST(String, HandlesThatShareMayBeUsedFromDifferentThreads)
{
    const String shared("abc");
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; t++) {
        threads.emplace_back([&shared] {
            for (int i = 0; i < 2000; i++) {
                String mine(shared);
                String other(mine);
                mine.append('d');
                other.clear();
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(1, rep_of(shared)->refs);
    EXPECT_STREQ("abc", shared.c_str());
}

TEST(String, PartsAreJoinedInTheirOrder)
{
    const auto joined = [](std::initializer_list<std::string_view> parts) {
        return String::joined({parts.begin(), parts.size()});
    };
    EXPECT_EQ(String(), joined({}));
    EXPECT_EQ(String::_empty.data, joined({"", ""}).c_str());
    EXPECT_STREQ("a_bc", joined({"a", "_", "", "bc"}).c_str());
    const String exact = joined({std::string(40, 'x'), std::string(24, 'y')});
    EXPECT_EQ(64u, exact.size());
    EXPECT_EQ(64u, exact.capacity());
    EXPECT_STREQ((std::string(40, 'x') + std::string(24, 'y')).c_str(), exact.c_str());
}

} // namespace KPRV

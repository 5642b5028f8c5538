#include "module/runtime/ground/Array.h"

#include "module/runtime/ground/Datetime.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/ground/type_dispatch.h"

#include <gtest/gtest.h>

#include <cmath>
#include <new>
#include <type_traits>
#include <utility>

namespace KPRV {

namespace {

/// Two different values of each type.
template <class T>
T value_of(int i)
{
    if constexpr (std::is_same_v<T, String>)
        return String(i ? "one" : "zero");
    else if constexpr (std::is_same_v<T, Datetime>)
        return Datetime(Datetime::SEC * static_cast<uint64>(i));
    else
        return static_cast<T>(i);
}

template <class T>
class Array_Typed_Test : public testing::Test
{
};

using All_Types = testing::Types<boolean, uint8, sint8, uint16, sint16, uint32, sint32, uint64, sint64,
                                 real32, real64, char16, String, Datetime>;
TYPED_TEST_SUITE(Array_Typed_Test, All_Types);

constexpr bool has_equal(Type type)
{
    return type == REAL32 || type == REAL64 || type == STRING || type == DATETIME;
}

} // namespace

TYPED_TEST(Array_Typed_Test, TraitsAreThoseOfTheCIMTable)
{
    constexpr Type code = Type_Code<TypeParam>::value;
    const __Array_Traits* traits = __Array_Traits_Factory<TypeParam>::traits();
    EXPECT_EQ(__cim_array_traits[code], traits);
    EXPECT_EQ(sizeof(TypeParam), traits->size);
    EXPECT_EQ(type_size[code], traits->size);
    const bool is_handle = code == STRING || code == DATETIME;
    EXPECT_EQ(is_handle, traits->construct != nullptr);
    EXPECT_EQ(is_handle, traits->destruct != nullptr);
    EXPECT_EQ(has_equal(code), traits->equal != nullptr);
}

TYPED_TEST(Array_Typed_Test, GrowsAndClonesAndCompares)
{
    const TypeParam zero = value_of<TypeParam>(0);
    const TypeParam one = value_of<TypeParam>(1);
    Array<TypeParam> a;
    EXPECT_EQ(0u, a.size());
    EXPECT_EQ(8u, a.capacity());
    for (int i = 0; i < 8; i++)
        a.append(i % 2 ? one : zero);
    EXPECT_EQ(8u, a.capacity());
    a.append(one);
    EXPECT_EQ(9u, a.capacity());
    a.prepend(one);
    EXPECT_EQ(10u, a.capacity());
    a.insert(1, zero);
    EXPECT_EQ(11u, a.size());
    EXPECT_TRUE(a[0] == one);
    EXPECT_TRUE(a[1] == zero);
    EXPECT_TRUE(a[10] == one);

    Array<TypeParam> b(a);
    EXPECT_EQ(11u, b.capacity());
    EXPECT_NE(a.data(), b.data());
    EXPECT_TRUE(a == b);
    b[0] = zero;
    EXPECT_FALSE(a == b);
    EXPECT_TRUE(a[0] == one);
    b.remove(0);
    EXPECT_EQ(10u, b.size());
    EXPECT_EQ(11u, b.capacity());
    EXPECT_FALSE(a == b);
    b = a;
    EXPECT_TRUE(a == b);
}

// Two arrays that were never used may share a block, and are two all the same.
TYPED_TEST(Array_Typed_Test, AssignedFromOneThatWasNeverUsedHasNoCapacity)
{
    const Array<TypeParam> fresh;
    Array<TypeParam> a;
    a = fresh;
    EXPECT_EQ(0u, a.capacity());
    Array<TypeParam> used;
    used.append(value_of<TypeParam>(1));
    used = fresh;
    EXPECT_EQ(0u, used.capacity());
    EXPECT_EQ(0u, used.size());
    Array<TypeParam> b;
    Array<TypeParam>& itself = b;
    b = itself;
    EXPECT_EQ(8u, b.capacity()) << "nothing becomes of one that is given to itself";
    a = itself;
    a.append(value_of<TypeParam>(1));
    EXPECT_EQ(1u, a.capacity());
}

TYPED_TEST(Array_Typed_Test, OfMoreThanThereIsRoomForIsRefused)
{
    Array<TypeParam> a;
    a.append(value_of<TypeParam>(1));
    // On 32 bits the size of such a block is no number that the allocator could be asked for.
    if (sizeof(size_t) == 4 && sizeof(TypeParam) > 1) {
        EXPECT_THROW(a.reserve(NPOS), std::bad_alloc);
    }
    EXPECT_EQ(1u, a.size());
    EXPECT_TRUE(a[0] == value_of<TypeParam>(1));
}

// A place for elements that know equality; only a yes for plain bytes.
TYPED_TEST(Array_Typed_Test, FindAnswersOneForAnyMatchOfPlainBytes)
{
    const TypeParam zero = value_of<TypeParam>(0);
    const TypeParam one = value_of<TypeParam>(1);
    Array<TypeParam> a;
    EXPECT_EQ(NPOS, a.find(one));
    for (int i = 0; i < 3; i++)
        a.append(zero);
    a.append(one);
    EXPECT_EQ(has_equal(Type_Code<TypeParam>::value) ? 3u : 1u, a.find(one));
    EXPECT_EQ(has_equal(Type_Code<TypeParam>::value) ? 0u : 1u, a.find(zero));
}

// Plain bytes ignore the fill: new elements are zero.
TYPED_TEST(Array_Typed_Test, ResizeFillsOnlyWhatHasAConstructor)
{
    constexpr Type code = Type_Code<TypeParam>::value;
    const TypeParam one = value_of<TypeParam>(1);
    Array<TypeParam> a;
    a.append(one);
    a.resize(10, one);
    EXPECT_EQ(10u, a.size());
    EXPECT_EQ(10u, a.capacity());
    EXPECT_TRUE(a[0] == one);
    EXPECT_TRUE(a[9] == (code == STRING || code == DATETIME ? one : value_of<TypeParam>(0)));
    a.resize(1, one);
    EXPECT_EQ(1u, a.size());
    EXPECT_EQ(10u, a.capacity());
    a.resize(1, one);
    EXPECT_EQ(1u, a.size());
}

TYPED_TEST(Array_Typed_Test, ElementsBeginBehindTheHead)
{
    Array<TypeParam> a;
    a.append(value_of<TypeParam>(1));
    const char* block = *reinterpret_cast<const char* const*>(&a);
    EXPECT_EQ(block + (sizeof(void*) == 4 ? 16 : 24), reinterpret_cast<const char*>(a.data()));
}

TYPED_TEST(Array_Typed_Test, ArraysWithoutElementsShareABlockUntilOneIsWritten)
{
    Array<TypeParam> a;
    const Array<TypeParam> b;
    const Array<TypeParam> clone(b);
    EXPECT_EQ(a.data(), b.data());
    EXPECT_EQ(8u, b.capacity());
    EXPECT_EQ(0u, clone.capacity());
    a.append(value_of<TypeParam>(1));
    EXPECT_NE(a.data(), b.data());
    EXPECT_EQ(8u, a.capacity());
    EXPECT_EQ(0u, b.size());
    Array<TypeParam> c;
    c.resize(2, value_of<TypeParam>(1));
    EXPECT_EQ(2u, c.size());
    EXPECT_EQ(8u, c.capacity());
    EXPECT_EQ(0u, b.size());
}

TEST(Array, ReserveIsExact)
{
    Array<uint32> a;
    a.reserve(3);
    EXPECT_EQ(8u, a.capacity());
    a.reserve(9);
    EXPECT_EQ(9u, a.capacity());
    a.reserve(100);
    EXPECT_EQ(100u, a.capacity());
    a.reserve(50);
    EXPECT_EQ(100u, a.capacity());
}

TEST(Array, ConstructionFromElementsHasTheirCapacity)
{
    const uint32 data[] = {1, 2, 3};
    const Array<uint32> a(data, 3);
    EXPECT_EQ(3u, a.size());
    EXPECT_EQ(3u, a.capacity());
    const Array<uint32> none(data, 0);
    EXPECT_EQ(0u, none.capacity());
    const Array<uint32> empty_clone{Array<uint32>()};
    EXPECT_EQ(0u, empty_clone.size());
    EXPECT_TRUE(none == empty_clone);
}

TEST(Array, AnEmptyOneCanBeUsedInEveryWay)
{
    for (int capacity : {0, 8}) {
        Array<String> a;
        if (capacity == 0)
            a = Array<String>(nullptr, 0);
        EXPECT_EQ(uint32(capacity), a.capacity());
        a.clear();
        a.remove(0);
        a.resize(0, String("x"));
        a.append(nullptr, 0);
        EXPECT_EQ(0u, a.size());
        EXPECT_EQ(a.begin(), a.end());
        Array<String> b(a);
        EXPECT_TRUE(a == b);
        b.append(String("x"));
        EXPECT_FALSE(a == b);
        a = b;
        EXPECT_EQ(1u, a.size());
        a.clear();
        EXPECT_EQ(0u, a.size());
        a.append(String("y"));
        EXPECT_STREQ("y", a[0].c_str());
        EXPECT_STREQ("x", b[0].c_str());
    }
}

TEST(Array, InsertAndRemoveInTheMiddle)
{
    const uint32 data[] = {1, 2, 3, 4, 5};
    Array<uint32> a(data, 5);
    a.insert(2, 9);
    EXPECT_EQ(9u, a[2]);
    EXPECT_EQ(3u, a[3]);
    a.remove(1, 3);
    EXPECT_EQ(3u, a.size());
    EXPECT_EQ(1u, a[0]);
    EXPECT_EQ(4u, a[1]);
    a.remove(1, 100);
    EXPECT_EQ(1u, a.size());
    a.remove(5);
    EXPECT_EQ(1u, a.size());
}

TEST(Array, AnArrayMayBeGivenItsOwnElements)
{
    Array<String> a;
    for (const char* text : {"a", "b", "c", "d", "e", "f", "g", "h"})
        a.append(String(text));
    a.append(a[0]);
    EXPECT_STREQ("a", a[8].c_str());
    a.insert(0, a[3]);
    EXPECT_STREQ("d", a[0].c_str());
    a.append(a.data(), a.size());
    EXPECT_EQ(20u, a.size());
    EXPECT_STREQ("a", a[19].c_str());
    a.resize(30, a[1]);
    EXPECT_STREQ("a", a[29].c_str());
    a.assign(a.data() + 4, 2);
    EXPECT_EQ(2u, a.size());
    EXPECT_STREQ("d", a[0].c_str());
    const Array<String>& self = a;
    a = self;
    EXPECT_EQ(2u, a.size());
}

TEST(Array, RealsCompareAsNumbers)
{
    const real64 nan = std::nan("");
    Array<real64> a(&nan, 1);
    EXPECT_FALSE(a == a);
    EXPECT_EQ(NPOS, a.find(nan));
    const real64 zeros[] = {0.0, -0.0};
    EXPECT_TRUE(Array<real64>(&zeros[0], 1) == Array<real64>(&zeros[1], 1));
}

TEST(Array, AZeroingResizeTakesNoFill)
{
    __Array_Rep* rep;
    __construct(rep, __cim_array_traits[UINT16]);
    __resize(rep, 3, nullptr);
    for (int i = 0; i < 3; i++)
        EXPECT_EQ(0, static_cast<const uint16*>(__data(rep))[i]);
    __destruct(rep);
}

namespace {

struct Counted
{
    static inline int alive = 0;
    int number;
    explicit Counted(int n) : number(n) { alive++; }
    Counted(const Counted& x) : number(x.number) { alive++; }
    ~Counted() { alive--; }
    bool operator==(const Counted& x) const { return number == x.number; }
};

} // namespace

TEST(Array, ElementsOfAnyClassAreConstructedAndDestructed)
{
    {
        Array<Counted> a;
        for (int i = 0; i < 12; i++)
            a.append(Counted(i));
        EXPECT_EQ(12, Counted::alive);
        Array<Counted> b(a);
        EXPECT_EQ(24, Counted::alive);
        b.remove(2, 3);
        EXPECT_EQ(21, Counted::alive);
        EXPECT_EQ(11u, a.find(Counted(11)));
        b.resize(20, Counted(5));
        EXPECT_EQ(32, Counted::alive);
        a = b;
        EXPECT_EQ(40, Counted::alive);
        b.clear();
        EXPECT_EQ(20, Counted::alive);
    }
    EXPECT_EQ(0, Counted::alive);
}

// Lists of instances move where there may be no memory, and their owner must not lose them.
TEST(Array, ThoseOfPointersMoveWithoutMemory)
{
    static_assert(std::is_nothrow_move_constructible_v<Array<int*>>);
    static_assert(std::is_nothrow_move_constructible_v<Array<String>>);
    static_assert(!std::is_nothrow_move_constructible_v<Array<Counted>>);
    int x = 0;
    Array<int*> a, b;
    EXPECT_EQ(std::as_const(a).data(), std::as_const(b).data());
    EXPECT_EQ(8u, a.capacity());
    a.append(&x);
    const Array<int*> moved(std::move(a));
    ASSERT_EQ(1u, moved.size());
    EXPECT_EQ(&x, moved[0]);
    // NOLINTNEXTLINE(bugprone-use-after-move): what is left is a fresh one.
    EXPECT_EQ(std::as_const(b).data(), std::as_const(a).data());
    EXPECT_EQ(0u, b.size());
}

TEST(Array, PointersAreRaw)
{
    int x = 0, y = 0;
    Array<int*> a;
    a.append(nullptr);
    a.append(nullptr);
    a.append(&x);
    EXPECT_EQ(__Array_Traits_Factory_Raw<void*>::traits(), __Array_Traits_Factory<int*>::traits());
    EXPECT_EQ(1u, a.find(&x));
    EXPECT_EQ(NPOS, a.find(&y));
}

} // namespace KPRV

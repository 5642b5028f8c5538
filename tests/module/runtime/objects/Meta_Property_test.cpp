#include "module/runtime/objects/Meta_Property.h"

#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

#include <cmath>

namespace KPRV {

namespace {

/// Compares one cell of two instances.
bool cells_equal(const Meta_Property& mp, const Ref<Sample_Types>& a, const Ref<Sample_Types>& b)
{
    return property_eq(&mp, &cell_at<char>(a.ptr(), mp.offset), &cell_at<char>(b.ptr(), mp.offset));
}

} // namespace

TEST(property_eq, ValuesOfEveryType)
{
    const Ref<Sample_Types> a = make_types(0);
    const Ref<Sample_Types> same = make_types(0);
    const Ref<Sample_Types> other = make_types(1);
#define X(TYPE, CODE)                                                                                        \
    EXPECT_TRUE(cells_equal(_Sample_Types_Scalar_##CODE, a, same)) << #CODE;                                 \
    EXPECT_FALSE(cells_equal(_Sample_Types_Scalar_##CODE, a, other)) << #CODE;                               \
    EXPECT_TRUE(cells_equal(_Sample_Types_Array_##CODE, a, same)) << #CODE;                                  \
    EXPECT_FALSE(cells_equal(_Sample_Types_Array_##CODE, a, other)) << #CODE;
    SAMPLE_TYPES(X)
#undef X
}

TEST(property_eq, NullStatesComeFirst)
{
    const Ref<Sample_Types> a = make_types(0);
    const Ref<Sample_Types> b = make_types(0);
#define X(TYPE, CODE)                                                                                        \
    b->Scalar_##CODE.null = 1;                                                                               \
    b->Array_##CODE.null = 1;                                                                                \
    EXPECT_FALSE(cells_equal(_Sample_Types_Scalar_##CODE, a, b)) << #CODE;                                   \
    EXPECT_FALSE(cells_equal(_Sample_Types_Array_##CODE, a, b)) << #CODE;                                    \
    a->Scalar_##CODE.null = 1;                                                                               \
    a->Array_##CODE.null = 1;                                                                                \
    EXPECT_TRUE(cells_equal(_Sample_Types_Scalar_##CODE, a, b)) << #CODE;                                    \
    EXPECT_TRUE(cells_equal(_Sample_Types_Array_##CODE, a, b)) << #CODE;
    SAMPLE_TYPES(X)
#undef X
}

// Two null cells differ when what lies in them differs; `clear` makes them equal.
TEST(property_eq, ValuesCountAlsoWhenBothAreNull)
{
    const Ref<Sample_Types> a = make_types(0);
    const Ref<Sample_Types> b = make_types(1);
    for (const Ref<Sample_Types>* x : {&a, &b})
        __set_null_flags(x->ptr(), true, true, 1);
#define X(TYPE, CODE)                                                                                        \
    EXPECT_FALSE(cells_equal(_Sample_Types_Scalar_##CODE, a, b)) << #CODE;                                   \
    EXPECT_FALSE(cells_equal(_Sample_Types_Array_##CODE, a, b)) << #CODE;
    SAMPLE_TYPES(X)
#undef X
    clear(a.ptr());
    clear(b.ptr());
    EXPECT_TRUE(identical(a.ptr(), b.ptr()));
}

TEST(property_eq, ANaNEqualsNothing)
{
    const Ref<Sample_Types> a = make_types(0);
    a->Scalar_REAL32.value = std::nanf("");
    a->Scalar_REAL64.value = std::nan("");
    a->Array_REAL64.value[0] = std::nan("");
    EXPECT_FALSE(cells_equal(_Sample_Types_Scalar_REAL32, a, a));
    EXPECT_FALSE(cells_equal(_Sample_Types_Scalar_REAL64, a, a));
    EXPECT_FALSE(cells_equal(_Sample_Types_Array_REAL64, a, a));
}

} // namespace KPRV

#include "module/runtime/objects/Prototype.h"

#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

namespace KPRV {

template <class T>
static void expect_own_copies(const Ref<T>& pattern)
{
    const Prototype<T> prototype(clone_of(pattern.ptr()));
    const Ref<T> first(prototype.copy());
    EXPECT_TRUE(identical(pattern.ptr(), first.ptr()));
    EXPECT_EQ(1, first->__refs);
    clear(first.ptr());
    EXPECT_TRUE(identical(pattern.ptr(), Ref<T>(prototype.copy()).ptr()));
}

TEST(Prototype, WhatIsDoneToACopyStaysWithTheCopy)
{
    expect_own_copies(Ref<Sample_Link>(create<Sample_Link>(true)));
    expect_own_copies(Ref<Sample_Element>(create<Sample_Element>(true)));
    expect_own_copies(make_types(0));
    expect_own_copies(make_group("g"));
}

TEST(Prototype, ACopyOutlivesIt)
{
    const auto copy = [] {
        return Ref<Sample_Group>(Prototype<Sample_Group>(make_group("g").steal()).copy());
    }();
    EXPECT_TRUE(identical(make_group("g").ptr(), copy.ptr()));
}

} // namespace KPRV

#include "module/runtime/objects/Instance.h"

#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

namespace KPRV {

TEST(Instance_clone, HasEveryCellAndACountOfItsOwn)
{
    const Ref<Sample_Types> x = make_types(0);
    x->__name_space = "root/kaldera";
    x->Scalar_UINT8.null = 1;
    x->Array_STRING.null = 1;
    ref(x.ptr());
    const Ref<Sample_Types> y(clone_of(x.ptr()));
    EXPECT_EQ(1, y->__refs);
    EXPECT_EQ(INSTANCE_MAGIC, y->__magic);
    EXPECT_TRUE(identical(x.ptr(), y.ptr()));
    EXPECT_STREQ("root/kaldera", y->__name_space.c_str());
    EXPECT_EQ(1, y->Scalar_UINT8.null);
    EXPECT_EQ(1, y->Array_STRING.null);
    unref(x.ptr());
}

TEST(Instance_clone, SharesNothingThatCanBeWritten)
{
    const Ref<Sample_Types> x = make_types(0);
    const Ref<Sample_Types> y(clone_of(x.ptr()));
    y->Scalar_STRING.value.append("!");
    y->Scalar_DATETIME.value.set(uint64(1));
    y->__name_space = "other";
#define X(TYPE, CODE)                                                                                        \
    EXPECT_NE(x->Array_##CODE.value.data(), y->Array_##CODE.value.data()) << #CODE;                          \
    y->Array_##CODE.value[0] = sample_value<TYPE>(1);                                                        \
    y->Array_##CODE.value.append(sample_value<TYPE>(1));
    SAMPLE_TYPES(X)
#undef X
    const Ref<Sample_Types> untouched = make_types(0);
    EXPECT_TRUE(identical(x.ptr(), untouched.ptr()));
}

TEST(Instance_clone, OfABlankRecordNeedsOnlyItsBytes)
{
    const Ref<Sample_Types> blank(create<Sample_Types>(false));
    clear(blank.ptr());
    ASSERT_TRUE(holds_nothing(blank.ptr()));
    const Ref<Instance> copy(clone_of_blank(blank.ptr()));
    EXPECT_TRUE(identical(blank.ptr(), copy.ptr()));
    EXPECT_EQ(1, copy->__refs);
    EXPECT_FALSE(holds_nothing(make_types(0).ptr()));
    // A list of references has a block of its own, and a text may be the only thing that is held.
    EXPECT_FALSE(holds_nothing(make_group("g").ptr()));
    const Ref<Sample_Types> text(create<Sample_Types>(false));
    text->Scalar_STRING.set("x");
    EXPECT_FALSE(holds_nothing(text.ptr()));
}

TEST(Instance_clone, ClonesWhatIsReferredTo)
{
    const Ref<Sample_Group> x = make_group("g");
    const Ref<Sample_Group> y(clone_of(x.ptr()));
    EXPECT_TRUE(identical(x.ptr(), y.ptr()));
    EXPECT_NE(x->Leader, y->Leader);
    EXPECT_EQ(1, y->Leader->__refs);
    EXPECT_EQ(1, x->Leader->__refs);
    ASSERT_EQ(3u, y->Members.value.size());
    EXPECT_NE(x->Members.value[0], y->Members.value[0]);
    EXPECT_EQ(nullptr, y->Members.value[1]);
    EXPECT_EQ(1, y->Members.value[2]->__refs);
    EXPECT_EQ(nullptr, clone(nullptr));
}

TEST(Instance_clone, OfAnInvocation)
{
    const Ref<Instance> x(create(&Sample_Element_Reset_method::static_meta_class));
    static_cast<Sample_Element_Reset_method*>(x.ptr())->Message.set(String("hello"));
    static_cast<Sample_Element_Reset_method*>(x.ptr())->Target = make_element("e");
    const Ref<Instance> y(clone(x.ptr()));
    EXPECT_TRUE(identical(x.ptr(), y.ptr()));
}

TEST(Instance_key_clone, HoldsTheKeysAndNothingElse)
{
    const Ref<Sample_Port> x(make_port("p", 7));
    const Ref<Sample_Port> y(static_cast<Sample_Port*>(key_clone(x.ptr())));
    EXPECT_TRUE(key_eq(x.ptr(), y.ptr()));
    EXPECT_EQ(0, y->Name.null);
    EXPECT_EQ(7u, y->Number.value);
    EXPECT_EQ(1, y->EnabledState.null);
    EXPECT_EQ(0, y->EnabledState.value);
    EXPECT_EQ(1, y->Words.null);
    EXPECT_EQ(nullptr, key_clone(nullptr));
    // The name space is no key.
    x->__name_space = "root";
    const Ref<Instance> z(key_clone(x.ptr()));
    EXPECT_TRUE(z->__name_space.empty());
}

TEST(Instance_key_clone, KeepsTheKeyReferences)
{
    const Ref<Sample_Link> x(create<Sample_Link>(true));
    x->Antecedent = make_element("e");
    x->Dependent = make_port("p", 1);
    const Ref<Sample_Link> y(static_cast<Sample_Link*>(key_clone(x.ptr())));
    EXPECT_NE(x->Antecedent, y->Antecedent);
    EXPECT_TRUE(key_eq(x.ptr(), y.ptr()));
}

TEST(Instance_copy, TakesEveryCellWithItsNullState)
{
    const Ref<Sample_Types> x = make_types(0);
    const Ref<Sample_Types> y = make_types(1);
    x->Scalar_SINT32.null = 1;
    x->__name_space = "root";
    copy(y.ptr(), x.ptr());
    EXPECT_EQ(1, y->Scalar_SINT32.null);
    // The name space is not copied.
    EXPECT_TRUE(y->__name_space.empty());
    y->__name_space = "root";
    EXPECT_TRUE(identical(x.ptr(), y.ptr()));
}

TEST(Instance_copy, ReplacesReferences)
{
    const Ref<Sample_Group> x = make_group("g");
    const Ref<Sample_Group> y(create<Sample_Group>(true));
    y->Leader = make_element("old");
    y->Members.value.append(make_port("old", 9));
    x->Members.null = 1;
    copy(y.ptr(), x.ptr());
    EXPECT_TRUE(identical(x.ptr(), y.ptr()));
    EXPECT_NE(x->Leader, y->Leader);
    EXPECT_EQ(1, y->Members.null);
    x->Leader = (unref(x->Leader), nullptr);
    copy(y.ptr(), x.ptr());
    EXPECT_EQ(nullptr, y->Leader);
}

TEST(Instance_copy, OfItselfOrOfATargetHeldByBoth)
{
    const Ref<Sample_Group> x = make_group("g");
    copy(x.ptr(), x.ptr());
    EXPECT_EQ(3u, x->Members.value.size());
    const Ref<Sample_Group> y(create<Sample_Group>(true));
    y->Leader = x->Leader;
    ref(x->Leader);
    copy(y.ptr(), x.ptr());
    EXPECT_NE(x->Leader, y->Leader);
    EXPECT_EQ(1, x->Leader->__refs);
}

TEST(Instance_copy, UnderAModelTakesWhatIsNotNullInIt)
{
    const Ref<Sample_Port> x(make_port("p", 1));
    x->EnabledState.set(9);
    x->Words.value.clear();
    const Ref<Sample_Port> model(create<Sample_Port>(false));
    __set_null_flags(model.ptr(), true, true, 1);
    model->Number.null = 0;
    model->Words.null = 0;
    const Ref<Sample_Port> y(make_port("q", 2));
    copy(y.ptr(), x.ptr(), model.ptr());
    EXPECT_STREQ("q", y->Name.value.c_str());
    EXPECT_EQ(1u, y->Number.value);
    EXPECT_EQ(5, y->EnabledState.value);
    EXPECT_EQ(0u, y->Words.value.size());
    EXPECT_EQ(3u, y->Codes.value.size());
}

// The null byte of a reference array is no filter, the null pointer of a reference is.
TEST(Instance_copy, UnderAModelReferenceArraysAreCopiedWhateverItSays)
{
    const Ref<Sample_Group> x = make_group("g");
    const Ref<Sample_Group> model(create<Sample_Group>(false));
    model->Members.null = 1;
    const Ref<Sample_Group> y(create<Sample_Group>(true));
    copy(y.ptr(), x.ptr(), model.ptr());
    EXPECT_EQ(3u, y->Members.value.size());
    EXPECT_EQ(0, y->Members.null);
    EXPECT_EQ(nullptr, y->Leader);
    model->Leader = make_element("any");
    copy(y.ptr(), x.ptr(), model.ptr());
    EXPECT_TRUE(identical(x->Leader, y->Leader));
}

TEST(Instance_copy, KeysOnly)
{
    const Ref<Sample_Port> x(make_port("p", 1));
    x->EnabledState.set(9);
    const Ref<Sample_Port> y(make_port("q", 2));
    copy_keys(y.ptr(), x.ptr());
    EXPECT_STREQ("p", y->Name.value.c_str());
    EXPECT_EQ(1u, y->Number.value);
    EXPECT_EQ(5, y->EnabledState.value);
}

TEST(Instance_copy, BetweenAClassAndItsSubclassDoesNothing)
{
    const Ref<Sample_Port> port(make_port("p", 1));
    const Ref<Sample_Element> element(make_element("e"));
    copy(element.ptr(), port.ptr());
    copy(port.ptr(), element.ptr());
    copy_keys(port.ptr(), element.ptr());
    copy(port.ptr(), element.ptr(), port.ptr());
    EXPECT_STREQ("e", element->Name.value.c_str());
    EXPECT_STREQ("p", port->Name.value.c_str());
}

TEST(Instance_clear, ResetsAllValuesToNull)
{
    const Ref<Sample_Types> x = make_types(1);
    x->__name_space = "root";
    clear(x.ptr());
    EXPECT_TRUE(x->__name_space.empty());
    expect_zero_cells(x.ptr(), 1);
}

TEST(Instance_clear, ReleasesReferences)
{
    const Ref<Sample_Group> x = make_group("g");
    Instance* leader = x->Leader;
    Instance* member = x->Members.value[2];
    ref(leader);
    ref(member);
    clear(x.ptr());
    EXPECT_EQ(nullptr, x->Leader);
    EXPECT_EQ(0u, x->Members.value.size());
    EXPECT_EQ(1, x->Members.null);
    EXPECT_EQ(1, leader->__refs);
    EXPECT_EQ(1, member->__refs);
    unref(leader);
    unref(member);
}

} // namespace KPRV

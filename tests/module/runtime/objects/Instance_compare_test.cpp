#include "module/runtime/objects/Instance.h"

#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

#include <cmath>

namespace KPRV {

namespace {

Ref<Sample_Link> make_link(Instance* antecedent, Instance* dependent)
{
    Ref<Sample_Link> result(create<Sample_Link>(true));
    result->Antecedent = antecedent;
    result->Dependent = dependent;
    return result;
}

/// A class with one key feature.
struct One_Key
{
    const Meta_Feature* features[1];
    Meta_Class record;
    One_Key(const Meta_Feature* key, uint32 size) : features{key}, record(Instance::static_meta_class)
    {
        record.name = "One_Key";
        record.meta_features = features;
        record.num_meta_features = 1;
        record.size = size;
    }
};

} // namespace

TEST(Instance_key_eq, LooksAtTheKeysOnly)
{
    const Ref<Sample_Port> a(make_port("p", 1));
    const Ref<Sample_Port> b(make_port("p", 1));
    b->EnabledState.set(77);
    b->__name_space = "other";
    EXPECT_TRUE(key_eq(a.ptr(), b.ptr()));
    b->Number.set(2);
    EXPECT_FALSE(key_eq(a.ptr(), b.ptr()));
    b->Number.set(1);
    b->Name.null = 1;
    EXPECT_FALSE(key_eq(a.ptr(), b.ptr()));
}

TEST(Instance_key_eq, OfDifferentClassesWithTheSameKeys)
{
    const Ref<Sample_Element> a(make_element("x"));
    const Ref<Sample_Other> b(create<Sample_Other>(false));
    b->NAME.set(String("x"));
    EXPECT_TRUE(key_eq(a.ptr(), b.ptr()));
    EXPECT_TRUE(key_eq(b.ptr(), a.ptr()));
    b->NAME.set(String("y"));
    EXPECT_FALSE(key_eq(a.ptr(), b.ptr()));
}

// The walk is over the keys of the first: the second may have more.
TEST(Instance_key_eq, IsNotSymmetric)
{
    const Ref<Sample_Element> a(make_element("x"));
    const Ref<Sample_Port> b(make_port("x", 1));
    EXPECT_TRUE(key_eq(a.ptr(), b.ptr()));
    EXPECT_FALSE(key_eq(b.ptr(), a.ptr()));
}

TEST(Instance_key_eq, NeedsAKeyOfTheSameTypeAndSubscript)
{
    const auto make = [](uint32 flags, uint16 type, sint16 subscript) {
        return Meta_Property{{{0, FLAG_PROPERTY | flags, "Size", nullptr, 0}},
                             type,
                             subscript,
                             _Sample_Other_Size.offset,
                             nullptr};
    };
    const Meta_Property key = make(FLAG_KEY, UINT32, 0);
    const Meta_Property no_key = make(0, UINT32, 0);
    const Meta_Property other_type = make(FLAG_KEY, SINT32, 0);
    const Meta_Property array = make(FLAG_KEY, UINT32, -1);
    const One_Key class_a(&key, sizeof(Sample_Other));
    const Ref<Instance> a(create(&class_a.record, false));
    for (const Meta_Property* counterpart : {&no_key, &other_type, &array}) {
        const One_Key class_b(counterpart, sizeof(Sample_Other));
        const Ref<Instance> b(create(&class_b.record, false));
        EXPECT_FALSE(key_eq(a.ptr(), b.ptr()));
    }
    const One_Key class_c(&key, sizeof(Sample_Other));
    const Ref<Instance> c(create(&class_c.record, false));
    EXPECT_TRUE(key_eq(a.ptr(), c.ptr()));
}

TEST(Instance_key_eq, AClassWithoutFeaturesEqualsAnything)
{
    const Ref<Instance> root(create(&Instance::static_meta_class, false));
    const Ref<Sample_Port> port(make_port("p", 1));
    EXPECT_TRUE(key_eq(root.ptr(), port.ptr()));
    EXPECT_FALSE(key_eq(port.ptr(), root.ptr()));
}

TEST(Instance_key_eq, FollowsReferences)
{
    const Ref<Sample_Link> a = make_link(make_element("e"), make_port("p", 1));
    const Ref<Sample_Link> b = make_link(make_port("e", 9), make_port("p", 1));
    // A target of a subclass has the key of the first.
    EXPECT_TRUE(key_eq(a.ptr(), b.ptr()));
    EXPECT_FALSE(key_eq(b.ptr(), a.ptr()));
    static_cast<Sample_Port*>(b->Dependent)->Number.set(2);
    EXPECT_FALSE(key_eq(a.ptr(), b.ptr()));
}

TEST(Instance_key_eq, NullReferencesEqualOnlyEachOther)
{
    const Ref<Sample_Link> a = make_link(make_element("e"), nullptr);
    const Ref<Sample_Link> b = make_link(make_element("e"), nullptr);
    EXPECT_TRUE(key_eq(a.ptr(), b.ptr()));
    b->Dependent = make_port("p", 1);
    EXPECT_FALSE(key_eq(a.ptr(), b.ptr()));
    EXPECT_FALSE(key_eq(b.ptr(), a.ptr()));
    EXPECT_TRUE(key_eq(nullptr, nullptr));
    EXPECT_FALSE(key_eq(a.ptr(), nullptr));
}

TEST(Instance_key_eq, ReferencesNeedRelatedTargetClasses)
{
    const auto make = [](uint32 flags, sint16 subscript, const Meta_Class& target) {
        return Meta_Reference{{{0, FLAG_REFERENCE | flags, "Antecedent", nullptr, 0}},
                              subscript,
                              &target,
                              _Sample_Link_Antecedent.offset};
    };
    const Meta_Reference element = make(FLAG_KEY, 0, Sample_Element::static_meta_class);
    const Meta_Reference port = make(FLAG_KEY, 0, Sample_Port::static_meta_class);
    const Meta_Reference group = make(FLAG_KEY, 0, Sample_Group::static_meta_class);
    const Meta_Reference no_key = make(0, 0, Sample_Element::static_meta_class);
    const Meta_Reference array = make(FLAG_KEY, -1, Sample_Element::static_meta_class);
    const One_Key class_a(&element, sizeof(Sample_Link));
    const Ref<Instance> a(create(&class_a.record, false));
    const auto equal = [](const Ref<Instance>& x, const Meta_Reference& other, bool turned) {
        const One_Key class_b(&other, sizeof(Sample_Link));
        const Ref<Instance> b(create(&class_b.record, false));
        return turned ? key_eq(b.ptr(), x.ptr()) : key_eq(x.ptr(), b.ptr());
    };
    EXPECT_TRUE(equal(a, port, false));
    EXPECT_TRUE(equal(a, port, true));
    EXPECT_FALSE(equal(a, group, false));
    EXPECT_FALSE(equal(a, no_key, false));
    EXPECT_FALSE(equal(a, array, false));
    // An array of references is skipped when it is the first's.
    EXPECT_TRUE(equal(a, array, true));
}

TEST(Instance_identical, NeedsTheSameClassNameSpaceAndCells)
{
    const Ref<Sample_Types> a = make_types(0);
    const Ref<Sample_Types> b = make_types(0);
    EXPECT_TRUE(identical(a.ptr(), b.ptr()));
    b->__name_space = "root";
    EXPECT_FALSE(identical(a.ptr(), b.ptr()));
    b->__name_space.clear();
#define X(TYPE, CODE)                                                                                        \
    {                                                                                                        \
        const Ref<Sample_Types> c = make_types(0);                                                           \
        c->Scalar_##CODE.set(sample_value<TYPE>(1));                                                         \
        EXPECT_FALSE(identical(a.ptr(), c.ptr())) << #CODE;                                                  \
        const Ref<Sample_Types> d = make_types(0);                                                           \
        d->Array_##CODE.null = 1;                                                                            \
        EXPECT_FALSE(identical(a.ptr(), d.ptr())) << #CODE;                                                  \
    }
    SAMPLE_TYPES(X)
#undef X
    const Ref<Sample_Element> element(make_element("x"));
    const Ref<Sample_Port> port(make_port("x", 1));
    EXPECT_FALSE(identical(element.ptr(), port.ptr()));
    EXPECT_FALSE(identical(element.ptr(), nullptr));
}

TEST(Instance_identical, ANaNDiffersFromItself)
{
    const Ref<Sample_Port> x(make_port("p", 1));
    x->Load.set(std::nan(""));
    EXPECT_FALSE(identical(x.ptr(), x.ptr()));
}

TEST(Instance_identical, FollowsReferencesAndArraysOfThem)
{
    const Ref<Sample_Group> a = make_group("g");
    const auto differs = [&a](auto change) {
        const Ref<Sample_Group> b = make_group("g");
        EXPECT_TRUE(identical(a.ptr(), b.ptr()));
        change(*b);
        return !identical(a.ptr(), b.ptr()) && !identical(b.ptr(), a.ptr());
    };
    EXPECT_TRUE(differs([](Sample_Group& b) { b.Leader = (unref(b.Leader), nullptr); }));
    EXPECT_TRUE(
        differs([](Sample_Group& b) { static_cast<Sample_Element*>(b.Leader)->EnabledState.set(9); }));
    EXPECT_TRUE(differs([](Sample_Group& b) { b.Members.null = 1; }));
    EXPECT_TRUE(differs([](Sample_Group& b) { b.Members.value.append(nullptr); }));
    EXPECT_TRUE(differs([](Sample_Group& b) { b.Members.value[1] = make_port("member", 3); }));
    EXPECT_TRUE(differs([](Sample_Group& b) { b.Members.value[0]->__name_space = "root"; }));
    EXPECT_TRUE(differs([](Sample_Group& b) { b.Members.value[2]->__name_space = "root"; }));
}

TEST(Instance_keys_non_null, NeedsEveryKeyAndNoOther)
{
    const Ref<Sample_Port> x(make_port("p", 1));
    x->EnabledState.null = 1;
    EXPECT_TRUE(keys_non_null(x.ptr()));
    x->Number.null = 1;
    EXPECT_FALSE(keys_non_null(x.ptr()));

    const Ref<Sample_Link> link = make_link(make_element("e"), nullptr);
    EXPECT_FALSE(keys_non_null(link.ptr()));
    link->Dependent = make_port("p", 1);
    EXPECT_TRUE(keys_non_null(link.ptr()));
    // The keys of the target are not asked.
    static_cast<Sample_Port*>(link->Dependent)->Number.null = 1;
    EXPECT_TRUE(keys_non_null(link.ptr()));
    const Ref<Instance> root(create(&Instance::static_meta_class, false));
    EXPECT_TRUE(keys_non_null(root.ptr()));
}

} // namespace KPRV

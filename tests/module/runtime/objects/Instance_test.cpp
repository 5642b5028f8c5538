#include "module/runtime/objects/Instance.h"

#include "module/runtime/objects/meta_build.h"
#include "module/runtime/objects/meta_destroy.h"
#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

#include <cstring>

namespace KPRV {

TEST(Instance, CreateFillsTheHeader)
{
    const Ref<Sample_Element> x(create<Sample_Element>(true));
    EXPECT_EQ(0xF00DFACEu, x->__magic);
    EXPECT_EQ(1, x->__refs);
    EXPECT_EQ(&Sample_Element::static_meta_class, x->__meta_class);
    EXPECT_TRUE(x->__name_space.empty());
    const Ref<Instance> root(create(&Instance::static_meta_class, true));
    EXPECT_EQ(&Instance::static_meta_class, root->__meta_class);
}

TEST(Instance, WithoutDefaultsAllCellsAreZeroAndNotNull)
{
    const Ref<Sample_Types> x(create<Sample_Types>(false));
    expect_zero_cells(x.ptr(), 0);
    const Ref<Sample_Element> element(create<Sample_Element>(false));
    EXPECT_EQ(0, element->EnabledState.value);
    EXPECT_EQ(0, element->EnabledState.null);
    EXPECT_EQ(0u, element->Words.value.size());
}

TEST(Instance, WithDefaultsCellsAreNullButForThoseWithADefault)
{
    const Ref<Sample_Types> x(create<Sample_Types>(true));
    expect_zero_cells(x.ptr(), 1);
}

TEST(Instance, DefaultsOfEveryShape)
{
    // A subclass inherits them.
    const Ref<Sample_Port> x(create<Sample_Port>(true));
    EXPECT_EQ(1, x->Name.null);
    EXPECT_EQ(0, x->EnabledState.null);
    EXPECT_EQ(5, x->EnabledState.value);
    EXPECT_EQ(0, x->Caption.null);
    EXPECT_STREQ("An element", x->Caption.value.c_str());
    EXPECT_EQ(0, x->Timeout.null);
    EXPECT_TRUE(x->Timeout.value == Datetime(5 * Datetime::MIN));
    EXPECT_EQ(0, x->Codes.null);
    ASSERT_EQ(3u, x->Codes.value.size());
    EXPECT_EQ(5u, x->Codes.value[2]);
    EXPECT_EQ(0, x->Words.null);
    ASSERT_EQ(2u, x->Words.value.size());
    EXPECT_STREQ("Up", x->Words.value[1].c_str());
    EXPECT_EQ(0, x->Pauses.null);
    ASSERT_EQ(2u, x->Pauses.value.size());
    EXPECT_TRUE(x->Pauses.value[1] == Datetime(2 * Datetime::SEC));
    EXPECT_EQ(1, x->Number.null);
    EXPECT_EQ(1, x->Load.null);
}

// References have no value at first, and the null byte of an array of them stays 0, with defaults too.
TEST(Instance, ReferencesStartEmpty)
{
    for (bool defaults : {false, true}) {
        const Ref<Sample_Group> x(create<Sample_Group>(defaults));
        EXPECT_EQ(nullptr, x->Leader);
        EXPECT_EQ(0u, x->Members.value.size());
        EXPECT_EQ(0, x->Members.null);
    }
}

TEST(Instance, InvocationsAreZeroAndNotNull)
{
    const Ref<Instance> x(create(&Sample_Element_Reset_method::static_meta_class));
    const auto* call = static_cast<const Sample_Element_Reset_method*>(x.ptr());
    EXPECT_EQ(as_class(&Sample_Element_Reset_method::static_meta_class), x->__meta_class);
    EXPECT_EQ(0, call->Force.null);
    EXPECT_EQ(0, call->return_value.null);
    EXPECT_EQ(nullptr, call->Target);
    EXPECT_EQ(nullptr, cast<Sample_Element>(x.ptr()));
}

// By the plan of its class or, where that has none, cell by cell.
TEST(Instance, OfNullsIsAFreshOneWithItsNullFlagsSet)
{
    Meta_Class* const made = create_meta_class("Made", &Sample_Port::static_meta_class, 0);
    for (const Meta_Class* meta_class :
         {&Sample_Types::static_meta_class, &Sample_Port::static_meta_class, &Sample_Group::static_meta_class,
          &Sample_Link::static_meta_class, as_class(&Sample_Element_Reset_method::static_meta_class),
          static_cast<const Meta_Class*>(made)}) {
        SCOPED_TRACE(meta_class->name);
        const Ref<Instance> expected(create(meta_class, false));
        __set_null_flags(expected.ptr(), true, true, 1);
        const Ref<Instance> x(create_null(meta_class));
        EXPECT_EQ(0, memcmp(static_cast<const void*>(expected.ptr()), static_cast<const void*>(x.ptr()),
                            meta_class->size));
    }
    EXPECT_EQ(1, made->refs);
    destroy(made);
    const Ref<Sample_Port> port(create_null<Sample_Port>());
    EXPECT_EQ(1, port->EnabledState.null);
    EXPECT_EQ(0, port->EnabledState.value);
    EXPECT_EQ(0, Ref<Sample_Group>(create_null<Sample_Group>())->Members.null);
}

TEST(Instance, ConstructionInPlaceWithoutClearingLeavesNumbers)
{
    alignas(8) unsigned char block[sizeof(Sample_Port)];
    memset(block, 0xAA, sizeof(block));
    Sample_Port* x = reinterpret_cast<Sample_Port*>(block);
    __default_construct(&Sample_Port::static_meta_class, x, false, true);
    EXPECT_EQ(INSTANCE_MAGIC, x->__magic);
    EXPECT_EQ(0xAAAAAAAAAAAAAAAAu, x->Number.value);
    EXPECT_EQ(1, x->Number.null);
    EXPECT_EQ(5, x->EnabledState.value);
    EXPECT_EQ(0, x->EnabledState.null);
    __destruct(x);
}

TEST(Instance, CountsAndOwnership)
{
    Sample_Element* target = make_element("x");
    Sample_Group* group = create<Sample_Group>(true);
    group->Leader = target;
    ref(target);
    EXPECT_EQ(2, target->__refs);
    ref(group);
    unref(group);
    EXPECT_EQ(1, group->__refs);
    unref(group);
    EXPECT_EQ(1, target->__refs);
    unref(target);
    ref(static_cast<Instance*>(nullptr));
    unref(static_cast<Instance*>(nullptr));
}

TEST(Instance, DestroyIgnoresTheCount)
{
    Sample_Group* group = make_group("g").steal();
    ref(group);
    destroy(group);
    destroyer(make_group("g").steal());
    destroyer(nullptr);
}

TEST(Instance, TheLastReferenceReleasesArraysOfReferences)
{
    Ref<Sample_Group> group = make_group("g");
    Instance* member = group->Members.value[0];
    ref(member);
    group.reset();
    EXPECT_EQ(1, member->__refs);
    unref(member);
}

TEST(Instance, CountsTheClassesMadeAtRunTime)
{
    Meta_Class* record = make_counted_class("Made");
    Instance* x = create(record, false);
    EXPECT_EQ(2, record->refs);
    // A clone does not count the class, though its end is counted.
    ref(record);
    Instance* y = clone(x);
    EXPECT_EQ(3, record->refs);
    unref(y);
    EXPECT_EQ(2, record->refs);
    unref(x);
    EXPECT_EQ(1, record->refs);
    unref(record);
}

TEST(Instance, CastIsTested)
{
    const Ref<Sample_Port> port(make_port("p", 1));
    Instance* x = port.ptr();
    EXPECT_EQ(port.ptr(), cast<Sample_Port>(x));
    EXPECT_NE(nullptr, cast<Sample_Element>(x));
    EXPECT_EQ(nullptr, cast<Sample_Group>(x));
    EXPECT_NE(nullptr, cast<Instance>(x));
    EXPECT_EQ(nullptr, cast<Sample_Port>(static_cast<Instance*>(nullptr)));
    const Ref<Sample_Element> element(make_element("e"));
    const Instance* y = element.ptr();
    EXPECT_EQ(nullptr, cast<Sample_Port>(y));
}

TEST(Ref, CountsWhatItHolds)
{
    Sample_Element* x = make_element("x");
    Ref<Sample_Element> a(x);
    EXPECT_EQ(1, x->__refs);
    {
        const Ref<Sample_Element> b(a);
        EXPECT_EQ(2, x->__refs);
        Ref<Sample_Element> c;
        EXPECT_FALSE(c);
        c = b;
        EXPECT_EQ(3, x->__refs);
        c = b;
        EXPECT_EQ(3, x->__refs);
        c = Ref<Sample_Element>(make_element("y"));
        EXPECT_STREQ("y", c->Name.value.c_str());
        Ref<Sample_Element> d(std::move(c));
        EXPECT_EQ(nullptr, c.ptr());
        EXPECT_EQ(1, (*d).__refs);
    }
    EXPECT_EQ(1, x->__refs);
    a.reset(make_element("z"));
    EXPECT_STREQ("z", a->Name.value.c_str());
    Sample_Element* stolen = a.steal();
    EXPECT_EQ(nullptr, a.ptr());
    EXPECT_EQ(1, stolen->__refs);
    unref(stolen);
}

} // namespace KPRV

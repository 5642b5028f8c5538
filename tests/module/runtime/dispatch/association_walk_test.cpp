#include "module/runtime/dispatch/association_walk.h"
#include "module/runtime/objects/Ref.h"
#include "tests/module/runtime/dispatch/Scripted_Provider.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <vector>

using namespace KPRV;

namespace {

struct Filters
{
    const char* result_class = "";
    const char* role = "";
    const char* result_role = "";
};

/// "-1", or the names of the far ends.
std::string far_ends(const Ref<Instance>& instance, const Ref<Instance>& association, Filters filters = {})
{
    Instance* out[MAX_ASSOCIATORS];
    const int count = get_associators(instance.ptr(), association.ptr(), filters.result_class, filters.role,
                                      filters.result_role, out);
    if (count < 0)
        return std::to_string(count);
    std::string names;
    for (int i = 0; i < count; i++)
        names += name_of_sample(out[i]) + ";";
    return names;
}

} // namespace

TEST(association_walk, GivesTheOtherEnd)
{
    const Ref<Instance> link(make_link(make_named("a"), make_port("b")));
    EXPECT_EQ(far_ends(Ref<Instance>(make_named("a")), link), "b;");
    EXPECT_EQ(far_ends(Ref<Instance>(make_port("b")), link), "a;");
}

namespace {

/// More far ends than there is room for.
struct Many_Ends : Instance
{
    static constexpr size_t COUNT = MAX_ASSOCIATORS + 2;
    Instance* ends[COUNT];
};

constexpr auto end_records = [] {
    std::array<Meta_Reference, Many_Ends::COUNT> records{};
    for (size_t i = 0; i < records.size(); i++)
        records[i] = {{{0, FLAG_REFERENCE | FLAG_READ, "End", nullptr, 0}},
                      0,
                      &Sample_Port::static_meta_class,
                      uint32(offsetof(Many_Ends, ends) + i * sizeof(Instance*))};
    return records;
}();

} // namespace

TEST(association_walk, MoreEndsThanThereIsRoomForAreLeftOut)
{
    std::array<const Meta_Feature*, Many_Ends::COUNT> features;
    std::ranges::transform(end_records, features.begin(), [](const Meta_Reference& each) { return &each; });
    const std::array<uint8, Many_Ends::COUNT> locals{};
    Meta_Class many = Sample_Link::static_meta_class;
    many.meta_features = features.data();
    many.num_meta_features = Many_Ends::COUNT;
    many.size = sizeof(Many_Ends);
    many.locals = locals.data();
    many.num_keys = 0;
    // Counted, so that nobody keeps what is known of it.
    many.refs = 1;
    const Ref<Instance> association(create(&many, false));
    std::string names;
    for (size_t i = 0; i < Many_Ends::COUNT; i++) {
        static_cast<Many_Ends*>(association.ptr())->ends[i] = make_port("p", int(i));
        names += i == 0 || i > MAX_ASSOCIATORS ? "" : "p;";
    }
    EXPECT_EQ(far_ends(Ref<Instance>(make_port("p", 0)), association), names);
}

TEST(association_walk, AnAssociationThatDoesNotTouchGivesMinusOne)
{
    const Ref<Instance> link(make_link(make_named("a"), make_port("b")));
    EXPECT_EQ(far_ends(Ref<Instance>(make_named("c")), link), "-1");
    // The keys match, but no reference is of an ancestor of this class.
    Ref<Instance> other(create<Sample_Other>(false));
    static_cast<Sample_Other*>(other.ptr())->NAME.set("a");
    EXPECT_EQ(far_ends(other, link), "-1");
}

TEST(association_walk, EndsOfOneClassWithOtherKeysAreFar)
{
    const Ref<Instance> link(make_link(make_port("p", 1), make_port("q", 2)));
    EXPECT_EQ(far_ends(Ref<Instance>(make_port("p", 1)), link), "q;");
    EXPECT_EQ(far_ends(Ref<Instance>(make_port("q", 2)), link), "p;");
    EXPECT_EQ(far_ends(Ref<Instance>(make_port("q", 1)), link), "-1");
}

TEST(association_walk, ALinkOfOneObjectWithItselfGivesNothing)
{
    const Ref<Instance> link(make_link(make_port("p", 1), make_port("p", 1)));
    EXPECT_EQ(far_ends(Ref<Instance>(make_port("p", 1)), link), "");
}

TEST(association_walk, RoleIsTheNameOfTheNearEnd)
{
    const Ref<Instance> link(make_link(make_named("a"), make_port("b")));
    const Ref<Instance> a(make_named("a"));
    EXPECT_EQ(far_ends(a, link, {.role = "Antecedent"}), "b;");
    EXPECT_EQ(far_ends(a, link, {.role = "ANTECEDENT"}), "b;");
    EXPECT_EQ(far_ends(a, link, {.role = "Dependent"}), "-1");
}

TEST(association_walk, ANearEndInAnotherRoleIsNoFarEndEither)
{
    // Both ends are near; only one has the role, which is enough to be found.
    const Ref<Instance> link(make_link(make_port("p", 1), make_port("p", 1)));
    EXPECT_EQ(far_ends(Ref<Instance>(make_port("p", 1)), link, {.role = "Dependent"}), "");
}

TEST(association_walk, ResultRoleIsTheNameOfTheFarEnd)
{
    const Ref<Instance> link(make_link(make_named("a"), make_port("b")));
    const Ref<Instance> a(make_named("a"));
    EXPECT_EQ(far_ends(a, link, {.result_role = "dependent"}), "b;");
    EXPECT_EQ(far_ends(a, link, {.result_role = "Antecedent"}), "");
}

TEST(association_walk, ResultClassIsTheFarEndOrAnAncestor)
{
    const Ref<Instance> link(make_link(make_named("a"), make_port("b")));
    const Ref<Instance> a(make_named("a"));
    const Ref<Instance> b(make_port("b"));
    EXPECT_EQ(far_ends(a, link, {.result_class = "sample_port"}), "b;");
    EXPECT_EQ(far_ends(a, link, {.result_class = "Sample_Element"}), "b;");
    EXPECT_EQ(far_ends(a, link, {.result_class = "Sample_Other"}), "");
    EXPECT_EQ(far_ends(b, link, {.result_class = "Sample_Port"}), "") << "a subclass of the far end";
}

TEST(association_walk, WhatFitsIsTheSameWheneverItIsAsked)
{
    const Ref<Instance> port(make_port("p"));
    const Meta_Class* const classes[] = {&Sample_Other::static_meta_class, &Sample_Element::static_meta_class,
                                         &Sample_Group::static_meta_class, &Sample_Port::static_meta_class,
                                         &Instance::static_meta_class,     &Sample_Types::static_meta_class};
    std::vector<Meta_Reference> references;
    for (const Meta_Class* meta_class : classes) {
        references.push_back(_Sample_Link_Antecedent);
        references.back().meta_class = meta_class;
    }
    Fitting_References fitting(port.ptr());
    for (int pass = 0; pass < 2; pass++) {
        for (const Meta_Reference& reference : references) {
            EXPECT_EQ(is_subclass(reference.meta_class, port->__meta_class), fitting.fits(&reference))
                << reference.meta_class->name;
        }
    }
}

TEST(association_walk, ReferenceArraysTakeNoPart)
{
    const Ref<Instance> group(create<Sample_Group>(false));
    auto* const sample = static_cast<Sample_Group*>(group.ptr());
    sample->Leader = make_named("a");
    sample->Members.value.append(make_port("m"));
    EXPECT_EQ(far_ends(Ref<Instance>(make_named("a")), group), "");
    EXPECT_EQ(far_ends(Ref<Instance>(make_port("m")), group), "-1");
    EXPECT_FALSE(is_reference_of(Ref<Instance>(make_port("m")).ptr(), group.ptr(), ""));
}

TEST(association_walk, AMissingReferenceIsPassedOver)
{
    const Ref<Instance> link(make_link(make_named("a"), nullptr));
    EXPECT_EQ(far_ends(Ref<Instance>(make_named("a")), link), "");
    EXPECT_EQ(far_ends(Ref<Instance>(make_port("b")), link), "-1");
}

TEST(association_walk, IsReferenceOfTestsKeysAndRole)
{
    const Ref<Instance> link(make_link(make_named("a"), make_port("b", 7)));
    const auto is_reference = [&](Instance* instance, const char* role) {
        const Ref<Instance> owner(instance);
        return is_reference_of(instance, link.ptr(), role);
    };
    EXPECT_TRUE(is_reference(make_named("a"), ""));
    EXPECT_TRUE(is_reference(make_named("a"), "antecedent"));
    EXPECT_FALSE(is_reference(make_named("a"), "Dependent"));
    EXPECT_TRUE(is_reference(make_port("b", 7), ""));
    EXPECT_TRUE(is_reference(make_port("b", 7), "Dependent"));
    EXPECT_FALSE(is_reference(make_port("b", 8), ""));
    EXPECT_FALSE(is_reference(make_named("c"), ""));
    // Unlike the walk to the far ends this one compares keys alone, whatever the classes.
    Sample_Other* const other = create<Sample_Other>(false);
    other->NAME.set("a");
    EXPECT_TRUE(is_reference(other, ""));
}

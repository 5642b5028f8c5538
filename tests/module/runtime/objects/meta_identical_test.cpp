#include "module/runtime/objects/meta_identical.h"

#include "tests/module/runtime/objects/meta_records.h"

#include <gtest/gtest.h>

#include <functional>

namespace KPRV {

namespace {

const Meta_Class* const NONE = nullptr;

/// True if a copy of the class is still identical to it after the change, from both sides.
template <class Change>
bool identical_after(const Meta_Class* source, Change&& change)
{
    const Owned_Class copy = cloned(source);
    change(copy);
    const bool result = identical(source, copy.get());
    EXPECT_EQ(result, identical(copy.get(), source));
    return result;
}

} // namespace

TEST(meta_identical, NothingIsIdenticalToNothingOnly)
{
    EXPECT_TRUE(identical(NONE, NONE));
    EXPECT_FALSE(identical(PORT, NONE));
    EXPECT_FALSE(identical(NONE, PORT));
    EXPECT_TRUE(identical(PORT, PORT));
    EXPECT_FALSE(identical(PORT, ELEMENT));
}

TEST(meta_identical, OfTheClass)
{
    EXPECT_TRUE(identical_after(PORT, [](const Owned_Class&) {}));
    EXPECT_FALSE(identical_after(PORT, [](const Owned_Class& x) { x->flags |= FLAG_TERMINAL; }));
    EXPECT_FALSE(identical_after(PORT, [](const Owned_Class& x) { x->size++; }));
    EXPECT_FALSE(identical_after(PORT, [](const Owned_Class& x) { x->num_keys++; }));
    EXPECT_FALSE(identical_after(PORT, [](const Owned_Class& x) { const_cast<uint8*>(x->locals)[0] = 1; }));
    EXPECT_FALSE(identical_after(PORT, [](const Owned_Class& x) { const_cast<char*>(x->name)[0] = 'X'; }));
    EXPECT_TRUE(identical_after(PORT, [](const Owned_Class& x) { const_cast<char*>(x->name)[0] = 's'; }))
        << "names have no case";
    EXPECT_FALSE(identical_after(PORT, [](const Owned_Class& x) {
        append(x.get(), create_meta_property("More", UINT8, 0, 0, false));
    }));
}

TEST(meta_identical, OfItsProperties)
{
    const auto changed = [](void (*change)(Meta_Property&)) {
        return identical_after(
            PORT, [=](const Owned_Class& x) { change(*own_feature<Meta_Property>(x, "Codes")); });
    };
    EXPECT_FALSE(changed([](Meta_Property& p) { p.type = SINT32; }));
    EXPECT_FALSE(changed([](Meta_Property& p) { p.subscript = 4; }));
    EXPECT_FALSE(changed([](Meta_Property& p) { p.offset++; }));
    EXPECT_FALSE(changed([](Meta_Property& p) { p.flags |= FLAG_WRITE; }));
    EXPECT_FALSE(changed([](Meta_Property& p) { const_cast<char*>(p.name)[0] = 'M'; }));
    EXPECT_TRUE(changed([](Meta_Property& p) { const_cast<char*>(p.name)[0] = 'c'; }));
    // Neither defaults nor qualifiers count.
    EXPECT_TRUE(changed([](Meta_Property& p) { add_qualifier(&p, qualifier("Units")); }));
    EXPECT_TRUE(
        changed([](Meta_Property& p) { const_cast<Meta_Value*>(p.value)->array_value.num_elements--; }));
}

TEST(meta_identical, OfItsReferences)
{
    const auto changed = [](const std::function<void(Meta_Reference&)>& change) {
        return identical_after(
            LINK, [&](const Owned_Class& x) { change(*own_feature<Meta_Reference>(x, "Antecedent")); });
    };
    EXPECT_FALSE(changed([](Meta_Reference& r) { r.offset++; }));
    EXPECT_FALSE(changed([](Meta_Reference& r) { r.meta_class = PORT; }));
    EXPECT_TRUE(changed([](Meta_Reference& r) { r.subscript = -1; })) << "not compared";
    const Owned_Class same_target = cloned(ELEMENT);
    EXPECT_TRUE(changed([&](Meta_Reference& r) {
        ref(same_target.get());
        r.meta_class = same_target.get();
    }));
}

TEST(meta_identical, OfItsMethods)
{
    const auto changed = [](void (*change)(Meta_Method&)) {
        return identical_after(PORT,
                               [=](const Owned_Class& x) { change(*own_feature<Meta_Method>(x, "Reset")); });
    };
    EXPECT_FALSE(changed([](Meta_Method& m) { m.return_type = UINT16; }));
    EXPECT_FALSE(changed([](Meta_Method& m) {
        static_cast<Meta_Property*>(const_cast<Meta_Feature*>(m.meta_features[0]))->type = UINT8;
    }));
    // The block's size is that of its parameters, which have been compared.
    EXPECT_TRUE(changed([](Meta_Method& m) { m.size++; }));
}

TEST(meta_identical, ASuperClassCountsWhereBothHaveOne)
{
    const Owned_Class super = cloned(ELEMENT);
    const auto with_super = [](const Meta_Class* other) {
        return identical_after(PORT, [=](const Owned_Class& x) {
            ref(other);
            x->super_meta_class = other;
        });
    };
    EXPECT_TRUE(with_super(nullptr));
    EXPECT_TRUE(with_super(super.get())) << "another record of the same class";
    EXPECT_FALSE(with_super(PORT));
}

TEST(meta_identical, WithoutTheTableNothingIsLocal)
{
    const Owned_Class other = cloned(&Sample_Other::static_meta_class);
    EXPECT_EQ(nullptr, other->locals);
    const Owned_Class derived(create_meta_class("Sample_Other", other.get(), 0));
    EXPECT_TRUE(identical(other.get(), derived.get()));
    other->locals = static_cast<uint8*>(calloc(2, 1));
    EXPECT_TRUE(identical(other.get(), derived.get()));
    const_cast<uint8*>(other->locals)[1] = 1;
    EXPECT_FALSE(identical(other.get(), derived.get()));
}

TEST(meta_identical, AClassThatRefersToItselfHasAnEnd)
{
    const Owned_Class a = cloned(LINK);
    Meta_Reference* reference = own_feature<Meta_Reference>(a, "Antecedent");
    reference->meta_class = a.get();
    EXPECT_TRUE(identical(a.get(), a.get()));
    const Owned_Class b = cloned(a.get());
    EXPECT_TRUE(identical(a.get(), b.get()));
    unref(a.get());
    own_feature<Meta_Reference>(b, "Antecedent")->meta_class = ELEMENT;
    reference->meta_class = ELEMENT;
}

} // namespace KPRV

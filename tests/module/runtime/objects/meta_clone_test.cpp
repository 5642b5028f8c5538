#include "module/runtime/objects/meta_clone.h"

#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/meta_destroy.h"
#include "module/runtime/objects/meta_identical.h"
#include "tests/module/runtime/objects/meta_records.h"
#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

#include <malloc.h>

namespace KPRV {

namespace {

} // namespace

// The address sanitizer tells that each copy is freed whole, and once.

TEST(meta_clone, AClassIsCopiedWithAllThatItOwns)
{
    const Owned_Class copy = cloned(PORT);
    EXPECT_EQ(1, copy->refs);
    EXPECT_EQ(PORT->flags, copy->flags);
    EXPECT_STREQ("Sample_Port", copy->name);
    EXPECT_NE(PORT->name, copy->name);
    EXPECT_EQ(PORT->num_meta_features, copy->num_meta_features);
    EXPECT_EQ(PORT->size, copy->size);
    EXPECT_EQ(PORT->num_keys, copy->num_keys);
    EXPECT_EQ(ELEMENT, copy->super_meta_class);
    EXPECT_EQ(0, ELEMENT->refs) << "a static table is not counted";
    EXPECT_EQ(nullptr, copy->meta_repository);
    EXPECT_EQ(nullptr, copy->meta_qualifiers);
    for (uint32 i = 0; i < copy->num_meta_features; i++) {
        EXPECT_NE(PORT->meta_features[i], copy->meta_features[i]);
        EXPECT_STREQ(PORT->meta_features[i]->name, copy->meta_features[i]->name);
        EXPECT_EQ(PORT->locals[i], copy->locals[i]);
    }
    EXPECT_NE(PORT->locals, copy->locals);
    EXPECT_TRUE(identical(PORT, copy.get()));
}

TEST(meta_clone, ACopyThatIsDestroyedLeavesNothing)
{
    const auto copy_each = [] {
        for (const Meta_Class* each : {PORT, ELEMENT, LINK})
            cloned(each);
    };
    copy_each();
    const size_t before = mallinfo2().uordblks;
    copy_each();
    EXPECT_EQ(before, mallinfo2().uordblks);
}

TEST(meta_clone, InstancesOfACopyWorkAsThoseOfTheSource)
{
    const Owned_Class copy = cloned(PORT);
    Instance* instance = create(copy.get(), true);
    EXPECT_EQ(2, copy->refs);
    const Sample_Port* port = static_cast<const Sample_Port*>(instance);
    EXPECT_EQ(5, port->EnabledState.value);
    EXPECT_STREQ("An element", port->Caption.value.c_str());
    EXPECT_EQ(3u, port->Codes.value.size());
    EXPECT_EQ(2u, port->Pauses.value.size());
    destroy(instance);
    EXPECT_EQ(1, copy->refs);
    // Without a repository it knows its ancestors alone.
    EXPECT_EQ(ELEMENT, find_meta_class(copy.get(), "Sample_Element"));
    EXPECT_EQ(nullptr, find_meta_class(copy.get(), "Sample_Group"));
    EXPECT_EQ(&Sample_Group::static_meta_class, find_meta_class(PORT, "Sample_Group"));
}

TEST(meta_clone, ClassesPointedAtAreCountedAndNotCopied)
{
    Meta_Class* target = create_meta_class("Target", nullptr, FLAG_CLASS);
    Meta_Class* super = create_meta_class("Super", nullptr, FLAG_CLASS);
    Meta_Reference reference = _Sample_Link_Antecedent;
    reference.meta_class = target;
    reference.refs = 3;
    Meta_Reference* copied = clone(&reference);
    EXPECT_EQ(2, target->refs);
    EXPECT_EQ(3, copied->refs) << "the count of a feature is the source's";
    EXPECT_EQ(target, copied->meta_class);
    EXPECT_EQ(reference.offset, copied->offset);
    Meta_Class* derived = create_meta_class("Derived", super, 0);
    append(derived, copied);
    EXPECT_EQ(2, super->refs);
    Meta_Class* again = clone(derived);
    EXPECT_EQ(3, super->refs);
    EXPECT_EQ(3, target->refs);
    unref(again);
    unref(derived);
    EXPECT_EQ(1, super->refs);
    EXPECT_EQ(1, target->refs);
    unref(super);
    unref(target);
}

TEST(meta_clone, ADefaultIsCopiedWhenAskedFor)
{
    Meta_Property* with = clone(&_Sample_Element_Caption);
    EXPECT_STREQ("An element", with->value->string_value);
    EXPECT_NE(_Sample_Element_Caption_MV.string_value, with->value->string_value);
    destroy(with);
    Meta_Property* without = clone(&_Sample_Element_Caption, false);
    EXPECT_EQ(nullptr, without->value);
    EXPECT_STREQ("Caption", without->name);
    EXPECT_EQ(_Sample_Element_Caption.offset, without->offset);
    destroy(without);
}

TEST(meta_clone, AFeatureByItsKind)
{
    Meta_Feature* property = clone(static_cast<const Meta_Feature*>(&_Sample_Element_Codes));
    EXPECT_EQ(-1, static_cast<Meta_Property*>(property)->subscript);
    EXPECT_EQ(3u, static_cast<Meta_Property*>(property)->value->array_value.num_elements);
    destroy(property);
    Meta_Feature* reference = clone(static_cast<const Meta_Feature*>(&_Sample_Group_Members));
    EXPECT_EQ(PORT, static_cast<Meta_Reference*>(reference)->meta_class);
    destroy(reference);
    Meta_Feature* method =
        clone(static_cast<const Meta_Feature*>(&Sample_Element_Reset_method::static_meta_class));
    const Meta_Method* copied = static_cast<Meta_Method*>(method);
    EXPECT_EQ(UINT32, copied->return_type);
    EXPECT_EQ(5u, copied->num_meta_features);
    EXPECT_EQ(sizeof(Sample_Element_Reset_method), copied->size);
    EXPECT_STREQ("return_value", copied->meta_features[4]->name);
    EXPECT_NE(Sample_Element_Reset_method::static_meta_class.meta_features[0], copied->meta_features[0]);
    destroy(method);
}

TEST(meta_clone, ValuesOfEveryShape)
{
    EXPECT_EQ(nullptr, clone(static_cast<const Meta_Value*>(nullptr), STRING, true));

    const Meta_Value number = {.sint64_value = -7};
    Meta_Value* copy = clone(&number, SINT64, false);
    EXPECT_EQ(-7, copy->sint64_value);
    destroy(copy, SINT64, false);

    copy = clone(&_Sample_Element_Timeout_MV, DATETIME, false);
    EXPECT_STREQ("00000000000500.000000:000", copy->string_value);
    EXPECT_NE(_Sample_Element_Timeout_MV.string_value, copy->string_value);
    destroy(copy, DATETIME, false);

    copy = clone(&_Sample_Element_Codes_MV, UINT32, true);
    EXPECT_EQ(3u, copy->array_value.num_elements);
    EXPECT_NE(_Sample_Element_Codes_MV.array_value.elements, copy->array_value.elements);
    EXPECT_EQ(0, memcmp(sample_codes, copy->array_value.elements, sizeof sample_codes));
    destroy(copy, UINT32, true);

    copy = clone(&_Sample_Element_Pauses_MV, DATETIME, true);
    const char* const* texts = static_cast<const char* const*>(copy->array_value.elements);
    EXPECT_STREQ(sample_pauses[1], texts[1]);
    EXPECT_NE(sample_pauses[1], texts[1]);
    destroy(copy, DATETIME, true);

    const Meta_Value empty = {.array_value = {nullptr, 0}};
    for (const Type type : {UINT8, STRING}) {
        copy = clone(&empty, type, true);
        EXPECT_EQ(nullptr, copy->array_value.elements);
        destroy(copy, type, true);
    }
}

TEST(meta_clone, QualifiersGoAlong)
{
    Owned_Class source = cloned(LINK);
    add_qualifier(source.get(), qualifier("Version", STRING, text_value("1.0")));
    add_qualifier(source.get(), qualifier("ValueMap", STRING, texts_value({"0", "1"}), true));
    add_qualifier(source.get(), qualifier("MaxLen", UINT32, uint32_value(64)));
    add_qualifier(own_feature<Meta_Reference>(source, "Antecedent"), qualifier("Min"));
    const Owned_Class copy = cloned(source.get());
    source.reset();
    EXPECT_EQ("Version ValueMap MaxLen", qualifier_names(copy.get()));
    EXPECT_STREQ("1.0", copy->meta_qualifiers[0]->value->string_value);
    EXPECT_EQ(64u, copy->meta_qualifiers[2]->value->uint32_value);
    EXPECT_EQ("Min", qualifier_names(copy->meta_features[0]));
    EXPECT_EQ(nullptr, copy->meta_features[0]->meta_qualifiers[0]->value);
}

TEST(meta_clone, AClassWithoutFeaturesIsCopiedToo)
{
    const Owned_Class copy = cloned(&Instance::static_meta_class);
    EXPECT_STREQ("Instance", copy->name);
    EXPECT_EQ(nullptr, copy->meta_features);
    EXPECT_EQ(nullptr, copy->locals);
    EXPECT_TRUE(is_subclass(copy.get(), PORT)) << "the name makes the root";
}

} // namespace KPRV

#include "module/runtime/objects/meta_build.h"

#include "module/runtime/ground/Property.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/meta_destroy.h"
#include "tests/module/runtime/objects/meta_records.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace KPRV {

namespace {

Owned_Class made(const char* name, const Meta_Class* super, uint32 flags = 0)
{
    return Owned_Class(create_meta_class(name, super, flags));
}

} // namespace

TEST(meta_build, AClassOfItsOwn)
{
    const Owned_Class made_class = made("Fresh", nullptr, FLAG_CLASS | FLAG_ABSTRACT);
    EXPECT_EQ(1, made_class->refs);
    EXPECT_EQ(FLAG_CLASS | FLAG_ABSTRACT, made_class->flags);
    EXPECT_STREQ("Fresh", made_class->name);
    EXPECT_EQ(sizeof(void*) == 4 ? 16u : 24u, made_class->size);
    EXPECT_EQ(0u, made_class->num_meta_features);
    EXPECT_EQ(0u, made_class->num_keys);
    EXPECT_EQ(nullptr, made_class->super_meta_class);
    EXPECT_EQ(nullptr, made_class->meta_repository);
    EXPECT_EQ(nullptr, made_class->locals);
}

TEST(meta_build, ASubclassIsACopyWithNothingLocal)
{
    const Owned_Class derived = made("Derived", ELEMENT, FLAG_ASSOCIATION | FLAG_ABSTRACT);
    EXPECT_EQ(ELEMENT->flags, derived->flags) << "the flags given are ignored";
    EXPECT_STREQ("Derived", derived->name);
    EXPECT_EQ(ELEMENT, derived->super_meta_class);
    EXPECT_EQ(ELEMENT->num_meta_features, derived->num_meta_features);
    EXPECT_EQ(ELEMENT->size, derived->size);
    EXPECT_EQ(1u, derived->num_keys);
    EXPECT_TRUE(std::all_of(derived->locals, derived->locals + derived->num_meta_features,
                            [](uint8 local) { return local == 0; }));
    EXPECT_EQ(1, ELEMENT->locals[0]);
    EXPECT_TRUE(is_subclass(ELEMENT, derived.get()));
}

TEST(meta_build, ASubclassIsNotAbstract)
{
    const Owned_Class super = made("Super", nullptr, FLAG_CLASS | FLAG_ABSTRACT);
    for (const char* name : {"Version", "ABSTRACT", "Abstract", "Abstracted"})
        add_qualifier(super.get(), qualifier(name));
    const Owned_Class derived = made("Derived", super.get());
    EXPECT_EQ(FLAG_CLASS, derived->flags);
    EXPECT_EQ("Version Abstracted", qualifier_names(derived.get()));
    EXPECT_EQ("Version ABSTRACT Abstract Abstracted", qualifier_names(super.get()));
    EXPECT_EQ(2, super->refs);
    // The super class of the copy is not the one of the copied.
    const Owned_Class third = made("Third", derived.get());
    EXPECT_EQ(2, super->refs);
    EXPECT_EQ(2, derived->refs);
    EXPECT_EQ(derived.get(), third->super_meta_class);
}

TEST(meta_build, Properties)
{
    Meta_Property* plain = create_meta_property("Plain", UINT16, -1, 40, false);
    EXPECT_EQ(0, plain->refs);
    EXPECT_EQ(0x2000001u, plain->flags);
    EXPECT_STREQ("Plain", plain->name);
    EXPECT_EQ(UINT16, plain->type);
    EXPECT_EQ(-1, plain->subscript);
    EXPECT_EQ(40u, plain->offset);
    EXPECT_EQ(nullptr, plain->value);
    Meta_Property* key = create_meta_property("Key", STRING, 0, 48, true);
    EXPECT_EQ(0x2200001u, key->flags);
    destroy(plain);
    destroy(key);
}

TEST(meta_build, AClassThatIsBuiltAtRunTimeMakesInstances)
{
    struct Record : Instance
    {
        Property<String> Name;
        Property<uint32> Count;
    };
    const Owned_Class built = made("Built", nullptr, FLAG_CLASS);
    append(built.get(), create_meta_property("Name", STRING, 0, offsetof(Record, Name), true));
    append(built.get(), create_meta_property("Count", UINT32, 0, offsetof(Record, Count), false));
    built->size = sizeof(Record);
    EXPECT_EQ(2u, built->num_meta_features);
    EXPECT_EQ(1u, built->num_keys);
    EXPECT_EQ(1, built->locals[0]);
    EXPECT_EQ(1, built->locals[1]);
    Instance* instance = create(built.get(), true);
    Record* record = static_cast<Record*>(instance);
    EXPECT_EQ(1, record->Name.null);
    record->Name.set("a");
    Instance* copy = clone(instance);
    EXPECT_TRUE(key_eq(instance, copy));
    destroy(instance);
    // A clone lowers the count that it has not raised: give it one.
    ref(built.get());
    destroy(copy);
    EXPECT_EQ(1, built->refs);
}

TEST(meta_build, AFeatureMoreLeavesTheOthersAsTheyAre)
{
    const Owned_Class derived = made("Derived", ELEMENT);
    const uint32 before = derived->num_meta_features;
    append(derived.get(), create_meta_property("More", STRING, 0, 0, true));
    EXPECT_EQ(before + 1, derived->num_meta_features);
    EXPECT_STREQ("More", derived->meta_features[before]->name);
    EXPECT_STREQ("Name", derived->meta_features[0]->name);
    EXPECT_EQ(0, derived->locals[0]);
    EXPECT_EQ(1, derived->locals[before]);
    EXPECT_EQ(2u, derived->num_keys);
    // A class without the table gets one.
    const Owned_Class other = cloned(&Sample_Other::static_meta_class);
    EXPECT_EQ(nullptr, other->locals);
    append(other.get(), create_meta_property("More", STRING, 0, 0, false));
    EXPECT_EQ(0, other->locals[0]);
    EXPECT_EQ(0, other->locals[1]);
    EXPECT_EQ(1, other->locals[2]);
}

TEST(meta_build, FilteredQualifiersKeepTheirOrder)
{
    const Owned_Class object = made("Class", nullptr, FLAG_CLASS);
    for (const char* name : {"A", "B", "C", "B", "D"})
        add_qualifier(object.get(), qualifier(name, STRING, text_value(name)));
    const auto filter = [&](std::initializer_list<const char*> names) {
        filter_qualifiers(static_cast<Meta_Qualified_Object*>(object.get()), names.begin(), names.size());
        return qualifier_names(object.get());
    };
    EXPECT_EQ("A B C B D", filter({"E", ""}));
    EXPECT_EQ("A C D", filter({"b"}));
    EXPECT_EQ("C", filter({"D", "a"}));
    EXPECT_NE(nullptr, object->meta_qualifiers);
    EXPECT_EQ("", filter({"C"}));
    EXPECT_EQ(nullptr, object->meta_qualifiers);
    EXPECT_EQ(0u, object->num_meta_qualifiers);
    EXPECT_EQ("", filter({"C"}));
}

TEST(meta_build, NullNamesRemoveAllQualifiers)
{
    const Owned_Class object = made("Class", nullptr, FLAG_CLASS);
    for (const char* name : {"A", "B"})
        add_qualifier(object.get(), qualifier(name));
    filter_qualifiers(static_cast<Meta_Qualified_Object*>(object.get()), nullptr, 0);
    EXPECT_EQ(0u, object->num_meta_qualifiers);
    EXPECT_EQ(nullptr, object->meta_qualifiers);
}

TEST(meta_build, AClassIsFilteredDownToItsParameters)
{
    const Owned_Class object = cloned(ELEMENT);
    const auto fill = [&](Meta_Qualified_Object* each) {
        add_qualifier(each, qualifier("Keep"));
        add_qualifier(each, qualifier("Drop"));
    };
    Meta_Method* method = own_feature<Meta_Method>(object, "Reset");
    Meta_Feature* parameter = const_cast<Meta_Feature*>(method->meta_features[0]);
    fill(object.get());
    fill(own_feature<Meta_Feature>(object, "Name"));
    fill(method);
    fill(parameter);
    const char* const names[] = {"Drop"};
    filter_qualifiers(static_cast<Meta_Qualified_Object*>(object.get()), names, 1);
    EXPECT_EQ("Keep", qualifier_names(object.get()));
    EXPECT_EQ("Keep Drop", qualifier_names(method)) << "the head alone";
    filter_qualifiers(object.get(), names, 1);
    EXPECT_EQ("Keep", qualifier_names(own_feature<Meta_Feature>(object, "Name")));
    EXPECT_EQ("Keep", qualifier_names(method));
    EXPECT_EQ("Keep", qualifier_names(parameter));
}

} // namespace KPRV

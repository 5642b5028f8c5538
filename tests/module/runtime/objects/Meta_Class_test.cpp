#include "module/runtime/objects/Meta_Class.h"

#include "module/runtime/objects/meta_destroy.h"
#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

#include <cstring>

namespace KPRV {

namespace {

const Meta_Class* const TYPES = &Sample_Types::static_meta_class;
const Meta_Class* const ELEMENT = &Sample_Element::static_meta_class;
const Meta_Class* const PORT = &Sample_Port::static_meta_class;
const Meta_Class* const GROUP = &Sample_Group::static_meta_class;
const Meta_Method* const RESET = &Sample_Element_Reset_method::static_meta_class;
const Meta_Class* const ROOT = &Instance::static_meta_class;

} // namespace

TEST(Meta_Class, TheRootHasNothingButTheHeader)
{
    EXPECT_STREQ("Instance", ROOT->name);
    EXPECT_EQ(FLAG_CLASS, ROOT->flags);
    EXPECT_EQ(0, ROOT->refs);
    EXPECT_EQ(0u, ROOT->num_meta_features);
    EXPECT_EQ(sizeof(void*) == 4 ? 16u : 24u, ROOT->size);
    EXPECT_EQ(nullptr, ROOT->super_meta_class);
    EXPECT_EQ(nullptr, ROOT->meta_repository);
}

TEST(Meta_Class, TheRepositoryFindsClassesInAnyCase)
{
    EXPECT_EQ(PORT, find_meta_class(&sample_repository, "Sample_Port"));
    EXPECT_EQ(PORT, find_meta_class(&sample_repository, "SAMPLE_PORT"));
    EXPECT_EQ(nullptr, find_meta_class(&sample_repository, "Sample_"));
    EXPECT_EQ(nullptr, find_meta_class(&sample_repository, ""));
    EXPECT_EQ(nullptr, find_meta_class(&sample_repository, nullptr));
    // Method records are not in it.
    EXPECT_EQ(nullptr, find_meta_class(&sample_repository, "Reset"));
    EXPECT_EQ(nullptr, find_meta_class(static_cast<const Meta_Repository*>(nullptr), "Sample_Port"));
    const Meta_Repository empty = {nullptr, 0};
    EXPECT_EQ(nullptr, find_meta_class(&empty, "Sample_Port"));
}

TEST(Meta_Class, AClassFindsItsAncestorsAndThenItsRepository)
{
    EXPECT_EQ(PORT, find_meta_class(PORT, "sample_port"));
    EXPECT_EQ(ELEMENT, find_meta_class(PORT, "SAMPLE_ELEMENT"));
    EXPECT_EQ(GROUP, find_meta_class(PORT, "Sample_Group"));
    EXPECT_EQ(nullptr, find_meta_class(PORT, "Nothing"));
    EXPECT_EQ(ROOT, find_meta_class(ROOT, "instance"));
    EXPECT_EQ(nullptr, find_meta_class(ROOT, "Sample_Port"));
    EXPECT_EQ(nullptr, find_meta_class(static_cast<const Meta_Class*>(nullptr), "Sample_Port"));
}

// A class in the chain wins over the repository's of the same name.
TEST(Meta_Class, TheChainComesBeforeTheRepository)
{
    Meta_Class impostor = *ROOT;
    impostor.name = "Sample_Port";
    impostor.meta_repository = &sample_repository;
    EXPECT_EQ(&impostor, find_meta_class(&impostor, "Sample_Port"));
    EXPECT_EQ(ELEMENT, find_meta_class(&impostor, "Sample_Element"));
}

TEST(Meta_Class, SubclassByRecords)
{
    EXPECT_TRUE(is_subclass(ELEMENT, ELEMENT));
    EXPECT_TRUE(is_subclass(ELEMENT, PORT));
    EXPECT_FALSE(is_subclass(PORT, ELEMENT));
    EXPECT_FALSE(is_subclass(GROUP, PORT));
    EXPECT_FALSE(is_subclass(ELEMENT, nullptr));
}

TEST(Meta_Class, EveryClassIsASubclassOfTheRootHoweverItIsHeld)
{
    Meta_Class other_root = *ROOT;
    other_root.name = "INSTANCE";
    for (const Meta_Class* root : {ROOT, static_cast<const Meta_Class*>(&other_root)}) {
        EXPECT_TRUE(is_subclass(root, PORT));
        EXPECT_TRUE(is_subclass(root, ROOT));
        EXPECT_TRUE(is_subclass(root, nullptr));
        EXPECT_TRUE(is_subclass(root, as_class(RESET)));
    }
}

TEST(Meta_Class, RecordsOfTheSameNameAreTheSameClass)
{
    Meta_Class copy = *ELEMENT;
    copy.name = "sample_ELEMENT";
    EXPECT_TRUE(is_subclass(&copy, PORT));
    EXPECT_TRUE(is_subclass(ELEMENT, &copy));
}

TEST(Meta_Class, AMethodRecordHasNoAncestors)
{
    EXPECT_TRUE(is_subclass(as_class(RESET), as_class(RESET)));
    EXPECT_FALSE(is_subclass(ELEMENT, as_class(RESET)));
    EXPECT_EQ(as_class(RESET), find_meta_class(as_class(RESET), "reset"));
    EXPECT_EQ(nullptr, find_meta_class(as_class(RESET), "Sample_Element"));
}

// 0 is the yes.
TEST(Meta_Class, SubclassByNames)
{
    EXPECT_EQ(0, is_subclass(&sample_repository, "Sample_Element", "Sample_Port"));
    EXPECT_EQ(0, is_subclass(&sample_repository, "sample_port", "SAMPLE_PORT"));
    EXPECT_EQ(1, is_subclass(&sample_repository, "Sample_Port", "Sample_Element"));
    EXPECT_EQ(1, is_subclass(&sample_repository, "Sample_Group", "Sample_Port"));
    EXPECT_EQ(-1, is_subclass(&sample_repository, "a", "b"));
    EXPECT_EQ(-1, is_subclass(&sample_repository, "Sample_Port", "b"));
    EXPECT_EQ(-1, is_subclass(&sample_repository, nullptr, "Sample_Port"));
    EXPECT_EQ(-1, is_subclass(&sample_repository, "Sample_Port", nullptr));
    EXPECT_EQ(-1, is_subclass(nullptr, "Sample_Port", "Sample_Port"));
}

TEST(Meta_Class, FeaturesAreFoundInAnyCaseAndByKind)
{
    EXPECT_EQ(&_Sample_Group_Leader, find_feature(GROUP, "LEADER", ANY_FEATURE));
    EXPECT_EQ(&_Sample_Group_Leader, find_feature(GROUP, "leader", FLAG_REFERENCE));
    EXPECT_EQ(nullptr, find_feature(GROUP, "Leader", FLAG_PROPERTY));
    EXPECT_EQ(nullptr, find_feature(GROUP, "Leader", FLAG_METHOD));
    EXPECT_EQ(&_Sample_Group_Name, find_feature(GROUP, "name", FLAG_PROPERTY));
    EXPECT_EQ(RESET, find_feature(PORT, "reset", FLAG_METHOD));
    EXPECT_EQ(nullptr, find_feature(PORT, "reset", FLAG_PROPERTY | FLAG_REFERENCE));
    EXPECT_EQ(nullptr, find_feature(PORT, "Leader", ANY_FEATURE));
    EXPECT_EQ(nullptr, find_feature(PORT, "", ANY_FEATURE));
    EXPECT_EQ(nullptr, find_feature(PORT, "Name", 0));
    EXPECT_EQ(nullptr, find_feature(ROOT, "Name", ANY_FEATURE));
}

TEST(Meta_Class, ParametersOfAMethod)
{
    EXPECT_EQ(&_Sample_Element_Reset_method_Force, find_parameter(RESET, "FORCE"));
    EXPECT_EQ(nullptr, find_parameter(RESET, "Target"));
    EXPECT_EQ(&_Sample_Element_Reset_method_Target, find_reference(RESET, "target"));
    EXPECT_EQ(nullptr, find_reference(RESET, "Force"));
    EXPECT_EQ(&_Sample_Element_Reset_method_return_value, find_feature(RESET, "RETURN_VALUE", ANY_FEATURE));
}

TEST(Meta_Class, FeatureMasks)
{
    EXPECT_TRUE(__has_feature_mask(GROUP, FLAG_REFERENCE));
    EXPECT_TRUE(__has_feature_mask(PORT, FLAG_METHOD));
    EXPECT_FALSE(__has_feature_mask(GROUP, FLAG_METHOD));
    EXPECT_FALSE(__has_feature_mask(TYPES, FLAG_REFERENCE));
    EXPECT_FALSE(__has_feature_mask(ROOT, ANY_FEATURE));
}

TEST(Meta_Class, StaticRecordsAreNeverCounted)
{
    ref(PORT);
    EXPECT_EQ(0, PORT->refs);
    unref(PORT);
    unref(PORT);
    EXPECT_EQ(0, PORT->refs);
    ref(static_cast<const Meta_Class*>(nullptr));
    unref(static_cast<const Meta_Class*>(nullptr));
}

// The address sanitizer tells whether the last count frees all that the record owns, and once.
TEST(Meta_Class, RecordsMadeAtRunTimeAreFreedByTheLastCount)
{
    Meta_Class* super = make_counted_class("Super");
    Meta_Class* record = make_counted_class("Class");
    record->super_meta_class = super;
    ref(record);
    EXPECT_EQ(2, record->refs);
    unref(record);
    EXPECT_EQ(1, record->refs);
    ref(super);
    unref(record);
    EXPECT_EQ(1, super->refs);
    unref(super);
}

TEST(Meta_Class, AFreedRecordTakesItsPartsAlong)
{
    Meta_Class* target = make_counted_class("Target");
    Meta_Class* record = make_counted_class("Class");

    const char** words = static_cast<const char**>(malloc(2 * sizeof(char*)));
    words[0] = strdup("a");
    words[1] = strdup("b");
    Meta_Value* value = static_cast<Meta_Value*>(calloc(1, sizeof(Meta_Value)));
    value->array_value.elements = words;
    value->array_value.num_elements = 2;

    Meta_Value* text = static_cast<Meta_Value*>(calloc(1, sizeof(Meta_Value)));
    text->string_value = strdup("x");
    Meta_Qualifier* qualifier = static_cast<Meta_Qualifier*>(calloc(1, sizeof(Meta_Qualifier)));
    qualifier->name = strdup("Description");
    qualifier->type = STRING;
    qualifier->value = text;
    const Meta_Qualifier** qualifiers = static_cast<const Meta_Qualifier**>(malloc(sizeof(void*)));
    qualifiers[0] = qualifier;

    Meta_Property* property = static_cast<Meta_Property*>(calloc(1, sizeof(Meta_Property)));
    property->flags = FLAG_PROPERTY;
    property->name = strdup("Words");
    property->type = STRING;
    property->subscript = -1;
    property->value = value;
    property->meta_qualifiers = qualifiers;
    property->num_meta_qualifiers = 1;
    Meta_Reference* reference = static_cast<Meta_Reference*>(calloc(1, sizeof(Meta_Reference)));
    reference->flags = FLAG_REFERENCE;
    reference->name = strdup("Target");
    reference->meta_class = target;
    ref(target);
    Meta_Method* method = static_cast<Meta_Method*>(calloc(1, sizeof(Meta_Method)));
    method->flags = FLAG_METHOD;
    method->name = strdup("Method");

    const Meta_Feature** features = static_cast<const Meta_Feature**>(malloc(3 * sizeof(void*)));
    features[0] = property;
    features[1] = reference;
    features[2] = method;
    record->meta_features = features;
    record->num_meta_features = 3;

    unref(record);
    EXPECT_EQ(1, target->refs);
    unref(target);
}

TEST(Meta_Qualifier, IsFoundInAnyCase)
{
    const Meta_Qualifier a = {0, "Description", STRING, 0, nullptr};
    const Meta_Qualifier b = {0, "MaxLen", UINT32, 0, nullptr};
    const Meta_Qualifier* const list[] = {&a, &b};
    EXPECT_EQ(&b, find(list, 2, "MAXLEN"));
    EXPECT_EQ(&a, find(list, 2, "description"));
    EXPECT_EQ(nullptr, find(list, 2, "Max"));
    EXPECT_EQ(nullptr, find(list, 1, "MaxLen"));
    EXPECT_EQ(nullptr, find(nullptr, 0, "MaxLen"));
}

} // namespace KPRV

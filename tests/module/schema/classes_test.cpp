#include "tests/module/schema/Catalogue_View.h"

#include "module/runtime/objects/Class_Plan.h"
#include "module/runtime/objects/Instance.h"

#include <gtest/gtest.h>
#include <set>
#include <utility>

using namespace KPRV;
using namespace KPRV::catalogue_view;

namespace {

struct Class_Row
{
    const char* name;
    uint32 features;
    uint32 keys;
};

const Class_Row class_rows[] = {
#include "tests/module/schema/features_and_keys.inc"
};

struct Product_Row
{
    const char* name;
    std::string superclass;
    std::string own;
};

const Product_Row product_rows[] = {
#include "tests/module/schema/product_classes.inc"
};

std::string names_with(uint32 flag)
{
    std::string names;
    for (const Meta_Class* meta_class : classes())
        if ((meta_class->flags & flag) && std::string(meta_class->name).starts_with("CIM_"))
            names += std::string(meta_class->name + 4) + " ";
    return names;
}

std::set<std::string> words(const std::string& text)
{
    std::set<std::string> result;
    std::string word;
    for (const char c : text + " ") {
        if (c != ' ')
            word += c;
        else if (!word.empty())
            result.insert(std::exchange(word, ""));
    }
    return result;
}

TEST(Classes, StandInTheRepositoryInOrderWithTheirFeaturesAndKeys)
{
    const std::vector<const Meta_Class*> all = classes();
    ASSERT_EQ(all.size(), 178u);
    ASSERT_EQ(std::size(class_rows), all.size());
    for (size_t i = 0; i < all.size(); i++) {
        SCOPED_TRACE(class_rows[i].name);
        EXPECT_STREQ(all[i]->name, class_rows[i].name);
        EXPECT_EQ(all[i]->num_meta_features, class_rows[i].features);
        EXPECT_EQ(all[i]->num_keys, class_rows[i].keys);
    }
}

TEST(Classes, TheLargestAndTheSmallest)
{
    EXPECT_EQ(find("KALDERA_FCPort").num_meta_features, 73u);
    EXPECT_EQ(find("KALDERA_TapeDrive").num_meta_features, 76u);
    EXPECT_EQ(find("KALDERA_AgentService").num_meta_features, 2u);
    for (const Product_Row& row : product_rows) {
        EXPECT_LE(find(row.name).num_meta_features, 76u);
        EXPECT_GE(find(row.name).num_meta_features, 2u);
    }
}

TEST(Classes, ASuperclassStandsBeforeItsSubclasses)
{
    std::set<const Meta_Class*> seen;
    for (const Meta_Class* meta_class : classes()) {
        if (meta_class->super_meta_class) {
            EXPECT_TRUE(seen.count(meta_class->super_meta_class)) << meta_class->name;
        }
        seen.insert(meta_class);
    }
}

TEST(Classes, ProductClassesDeclareTheirFeaturesInFeatureOrder)
{
    ASSERT_EQ(std::size(product_rows), 77u);
    for (const Product_Row& row : product_rows) {
        SCOPED_TRACE(row.name);
        const Meta_Class& meta_class = find(row.name);
        const Meta_Class* superclass = meta_class.super_meta_class;
        EXPECT_EQ(superclass ? superclass->name : "", row.superclass);
        std::string own, methods;
        for (const Meta_Feature* feature : own_features(meta_class))
            (feature->flags & FLAG_METHOD ? methods : own) += std::string(feature->name) + " ";
        EXPECT_EQ(own + methods, row.own.empty() ? "" : row.own + " ");
    }
}

TEST(Classes, Roots)
{
    std::string roots;
    for (const Meta_Class* meta_class : classes())
        if (!meta_class->super_meta_class)
            roots += std::string(meta_class->name) + " ";
    EXPECT_EQ(words(roots),
              words("CIM_AffectedJobElement CIM_Component CIM_Dependency CIM_DiagnosticResult "
                    "CIM_ElementCapabilities "
                    "CIM_ElementConformsToProfile CIM_ElementStatisticalData CIM_Error CIM_Indication "
                    "CIM_InitiatorTargetLogicalUnitPath CIM_InstalledSoftwareIdentity CIM_ManagedElement "
                    "CIM_MemberOfCollection CIM_OwningJobElement CIM_ServiceAvailableToElement "
                    "KALDERA_AgentService"));
}

TEST(Classes, AbstractOnes)
{
    EXPECT_EQ(
        words(names_with(FLAG_ABSTRACT)),
        words(
            "Capabilities Collection CollectionOfMSEs Component Controller Dependency DiagnosticService "
            "EnabledLogicalElement Indication Job LogicalDevice LogicalElement ManagedElement "
            "ManagedSystemElement PhysicalElement ProcessIndication RecordForLog Service ServiceAccessPoint "
            "Setting SettingData StatisticalData System WBEMService"));
    for (const Product_Row& row : product_rows)
        EXPECT_FALSE(find(row.name).flags & FLAG_ABSTRACT) << row.name;
}

TEST(Classes, AreOfOneKindThatTheirDescendantsShare)
{
    for (const Meta_Class* meta_class : classes()) {
        SCOPED_TRACE(meta_class->name);
        const uint32 kind =
            meta_class->flags & (FLAG_CLASS | FLAG_ASSOCIATION | FLAG_INDICATION | FLAG_METHOD);
        EXPECT_TRUE(kind == FLAG_CLASS || kind == FLAG_ASSOCIATION || kind == FLAG_INDICATION);
        if (meta_class->super_meta_class) {
            EXPECT_TRUE(meta_class->super_meta_class->flags & kind);
        }
        const uint32 allowed = kind | FLAG_ABSTRACT | FLAG_EXPERIMENTAL |
                               (kind == FLAG_ASSOCIATION ? uint32(FLAG_AGGREGATION) : 0);
        EXPECT_EQ(meta_class->flags & ~allowed, 0u) << flags(meta_class->flags);
    }
    // An error is an exception, and the schema makes exceptions indications.
    EXPECT_EQ(words(names_with(FLAG_INDICATION)),
              words("Error Indication ProcessIndication AlertIndication"));
    EXPECT_EQ(words(names_with(FLAG_EXPERIMENTAL)),
              words("DiagnosticSettingData InitiatorTargetLogicalUnitPath ProductElementComponent "
                    "ReferencedSpecification RegisteredSpecification"));
}

// What a class inherits unchanged is the record of the class that declares it, so that its offset, flags and
// default are the same throughout.
TEST(Classes, InheritTheRecordsThatTheyDoNotDeclare)
{
    for (const Meta_Class* meta_class : classes()) {
        SCOPED_TRACE(meta_class->name);
        const Meta_Class* superclass = meta_class->super_meta_class;
        const uint32 inherited = superclass ? superclass->num_meta_features : 0;
        ASSERT_LE(inherited, meta_class->num_meta_features);
        for (uint32 i = 0; i < meta_class->num_meta_features; i++) {
            ASSERT_LE(meta_class->locals[i], 1);
            if (i >= inherited) {
                EXPECT_EQ(meta_class->locals[i], 1);
            } else if (!meta_class->locals[i]) {
                EXPECT_EQ(meta_class->meta_features[i], superclass->meta_features[i]);
            } else {
                EXPECT_STREQ(meta_class->meta_features[i]->name, superclass->meta_features[i]->name);
            }
        }
    }
}

// There is room for the plans of all of them, and of their methods, in whatever order they are asked for.
TEST(Classes, EachHasAPlan)
{
    for (const Meta_Class* meta_class : classes()) {
        EXPECT_TRUE(plan_of(meta_class)) << meta_class->name;
        for (const Meta_Feature* feature : features_of(meta_class)) {
            if (feature->flags & FLAG_METHOD) {
                EXPECT_TRUE(plan_of(as_class(static_cast<const Meta_Method*>(feature)))) << feature->name;
            }
        }
    }
}

TEST(Classes, TheRootRecordIsNotInTheRepository)
{
    EXPECT_EQ(KPRV::find_meta_class(classes().front()->meta_repository, "Instance"), nullptr);
    EXPECT_EQ(KPRV::find_meta_class(classes().front()->meta_repository, "kaldera_fcport"),
              &find("KALDERA_FCPort"));
    EXPECT_EQ(Instance::static_meta_class.meta_repository, nullptr);
    for (const Meta_Class* meta_class : classes())
        EXPECT_EQ(meta_class->meta_repository, classes().front()->meta_repository);
}

} // namespace

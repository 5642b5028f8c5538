#include "tests/module/schema/Catalogue_View.h"

#include "module/runtime/objects/Instance.h"

#include <functional>
#include <gtest/gtest.h>
#include <set>

using namespace KPRV;
using namespace KPRV::catalogue_view;

namespace {

/// Every feature of every class, and every parameter of every method that the class declares.
void each_feature(const std::function<void(const Meta_Class&, const Meta_Feature&)>& look)
{
    for (const Meta_Class* meta_class : classes())
        for (uint32 i = 0; i < meta_class->num_meta_features; i++)
            look(*meta_class, *meta_class->meta_features[i]);
}

void each_parameter(
    const std::function<void(const Meta_Class&, const Meta_Method&, const Meta_Feature&)>& look)
{
    each_feature([&](const Meta_Class& meta_class, const Meta_Feature& feature) {
        if (feature.flags & FLAG_METHOD)
            for (uint32 i = 0; i < as_method(feature).num_meta_features; i++)
                look(meta_class, as_method(feature), *as_method(feature).meta_features[i]);
    });
}

TEST(Features, CarryOnlyTheFlagsOfTheCatalogue)
{
    uint32 of_features = 0;
    uint32 of_parameters = 0;
    each_feature([&](const Meta_Class&, const Meta_Feature& feature) { of_features |= feature.flags; });
    each_parameter([&](const Meta_Class&, const Meta_Method&, const Meta_Feature& parameter) {
        of_parameters |= parameter.flags;
    });
    EXPECT_EQ(flags(of_features),
              "Property,Reference,Method,Aggregate,Counter,Experimental,Gauge,Key,Read,Required,"
              "Weak,Write");
    EXPECT_EQ(flags(of_parameters), "Property,Reference,In,OctetString,Out,Required,EmbeddedInstance");
}

TEST(Features, HaveNoQualifiersAndAreNotCounted)
{
    const auto is_plain = [](const Meta_Feature& record) {
        EXPECT_EQ(record.refs, 0) << record.name;
        EXPECT_EQ(record.meta_qualifiers, nullptr) << record.name;
        EXPECT_EQ(record.num_meta_qualifiers, 0u) << record.name;
    };
    for (const Meta_Class* meta_class : classes())
        is_plain(*meta_class);
    each_feature([&](const Meta_Class&, const Meta_Feature& feature) { is_plain(feature); });
    each_parameter(
        [&](const Meta_Class&, const Meta_Method&, const Meta_Feature& parameter) { is_plain(parameter); });
}

TEST(Features, AreOfOneKindAndNamedOnce)
{
    for (const Meta_Class* meta_class : classes()) {
        std::set<std::string> names;
        for (uint32 i = 0; i < meta_class->num_meta_features; i++) {
            const Meta_Feature& feature = *meta_class->meta_features[i];
            const uint32 kind = feature.flags & (FLAG_PROPERTY | FLAG_REFERENCE | FLAG_METHOD);
            EXPECT_TRUE(kind == FLAG_PROPERTY || kind == FLAG_REFERENCE || kind == FLAG_METHOD)
                << feature.name;
            EXPECT_TRUE(names.insert(feature.name).second) << meta_class->name << "." << feature.name;
        }
    }
}

// A property is always readable; nothing else says so.
TEST(Features, OnlyPropertiesAreRead)
{
    each_feature([](const Meta_Class& meta_class, const Meta_Feature& feature) {
        EXPECT_EQ(bool(feature.flags & FLAG_READ), bool(feature.flags & FLAG_PROPERTY))
            << meta_class.name << "." << feature.name;
    });
}

TEST(Features, ArraysAreOfVariableLength)
{
    const auto check = [](const Meta_Feature& feature) {
        if (feature.flags & FLAG_PROPERTY) {
            EXPECT_TRUE(as_property(feature).subscript == 0 || as_property(feature).subscript == -1);
        }
        if (feature.flags & FLAG_REFERENCE) {
            EXPECT_TRUE(as_reference(feature).subscript == 0 || as_reference(feature).subscript == -1);
        }
    };
    each_feature([&](const Meta_Class&, const Meta_Feature& feature) { check(feature); });
    each_parameter(
        [&](const Meta_Class&, const Meta_Method&, const Meta_Feature& parameter) { check(parameter); });
}

TEST(Features, StatisticsOfAnFcPortAreCounters)
{
    const Meta_Class& statistics = find("KALDERA_FCPortStatistics");
    EXPECT_EQ(own_features(statistics).size(), 14u);
    for (const Meta_Feature* feature : own_features(statistics))
        EXPECT_EQ(flags(feature->flags), "Property,Counter,Read") << feature->name;
}

TEST(Features, MarksOfSingleProperties)
{
    const auto marks = [](const char* meta_class, const char* feature) {
        const Meta_Class& c = find(meta_class);
        return flags(c.meta_features[position(c, feature)]->flags);
    };
    EXPECT_EQ(marks("KALDERA_ConcreteJob", "TimeBeforeRemoval"), "Property,Read,Required,Write");
    EXPECT_EQ(marks("KALDERA_AlertIndication", "PerceivedSeverity"), "Property,Read,Required");
    EXPECT_EQ(marks("KALDERA_AlertIndication", "AlertType"), "Property,Read,Required");
    EXPECT_EQ(marks("KALDERA_AlertIndication", "ProbableCause"), "Property,Read,Required");
    for (const char* name : {"Message", "MessageArguments", "MessageID", "OwningEntity"})
        EXPECT_EQ(marks("KALDERA_AlertIndication", name), "Property,Experimental,Read") << name;
    EXPECT_EQ(marks("KALDERA_AlertIndication", "Category"), "Property,Read");
    EXPECT_EQ(marks("KALDERA_FCPort", "DeviceID"), "Property,Key,Read");
    // Experimental is not inherited by an override.
    EXPECT_EQ(marks("CIM_RegisteredProfile", "SpecificationType"), "Property,Experimental,Read");
}

TEST(Features, AlertIndicationAddsACategoryOfItsOwn)
{
    EXPECT_EQ(position(find("KALDERA_AlertIndication"), "Category"),
              find("CIM_AlertIndication").num_meta_features);
}

// Cells follow each other in feature order, inside the record, behind the header.
TEST(Features, LieInTheRecordInFeatureOrder)
{
    for (const Meta_Class* meta_class : classes()) {
        SCOPED_TRACE(meta_class->name);
        uint32 end = sizeof(Instance);
        for (uint32 i = 0; i < meta_class->num_meta_features; i++) {
            const Meta_Feature& feature = *meta_class->meta_features[i];
            if (feature.flags & FLAG_METHOD)
                continue;
            const bool reference = feature.flags & FLAG_REFERENCE;
            const uint32 offset = reference ? as_reference(feature).offset : as_property(feature).offset;
            const bool array =
                (reference ? as_reference(feature).subscript : as_property(feature).subscript) != 0;
            const uint32 size = reference || array ? sizeof(void*) : type_size[as_property(feature).type];
            EXPECT_GE(offset, end) << feature.name;
            EXPECT_LE(offset, end + 8) << feature.name;
            end = offset + size + (reference && !array ? 0 : 1);
        }
        EXPECT_LE(end, meta_class->size);
        EXPECT_LE(meta_class->size, end + 8);
    }
}

} // namespace

#include "tests/module/schema/Catalogue_View.h"

#include "module/runtime/ground/Datetime.h"
#include "module/schema/KALDERA_LogicalDisk.h"
#include "module/schema/KALDERA_StorageExtent.h"

#include <gtest/gtest.h>
#include <map>
#include <set>

using namespace KPRV;
using namespace KPRV::catalogue_view;

namespace {

struct Default_Row
{
    const char* property;
    const char* type;
    const char* value;
    /// The classes that state it, then one that inherits it ("" where none does).
    std::vector<const char*> declaring;
    std::string heir;
};

// clang-format off
const Default_Row rows[] = {
    {"AccessContext",          "uint16",   "0",     {"CIM_RemoteServiceAccessPoint"},                                  "KALDERA_RemoteServiceAccessPoint"},
    {"AlertingElementFormat",  "uint16",   "0",     {"CIM_AlertIndication", "KALDERA_AlertIndication"},                ""},
    {"CommunicationMechanism", "uint16",   "2",     {"CIM_CIMXMLCommunicationMechanism", "KALDERA_CIMXMLCommunicationMechanism"}, ""},
    {"ControllerType",         "uint16",   "4",     {"KALDERA_PortController"},                                        ""},
    {"EnabledDefault",         "uint16",   "2",     {"CIM_EnabledLogicalElement"},                                     "KALDERA_FCPort"},
    {"EnabledState",           "uint16",   "5",     {"CIM_EnabledLogicalElement"},                                     "KALDERA_LANEndpoint"},
    {"ErrorSourceFormat",      "uint16",   "0",     {"CIM_Error"},                                                     ""},
    {"GatherStatisticalData",  "boolean",  "true",  {"CIM_ObjectManager"},                                             "KALDERA_ObjectManager"},
    {"IsComposite",            "boolean",  "true",  {"CIM_StorageExtent"},                                             "KALDERA_LogicalDisk"},
    {"IsEntity",               "boolean",  "false", {"CIM_SoftwareIdentity"},                                          "KALDERA_AdapterSoftwareIdentity"},
    {"IsLargeBuildNumber",     "boolean",  "false", {"CIM_SoftwareIdentity"},                                          "KALDERA_ProfileSoftwareIdentity"},
    {"JobRunTimes",            "uint32",   "1",     {"CIM_Job", "CIM_JobSettingData"},                                 "KALDERA_ConcreteJob"},
    {"NameFormat",             "uint16",   "12",    {"CIM_LogicalDisk", "KALDERA_LogicalDisk", "KALDERA_StorageExtent"}, ""},
    {"NameNamespace",          "uint16",   "8",     {"CIM_LogicalDisk", "KALDERA_LogicalDisk"},                        ""},
    {"NonDestructive",         "boolean",  "false", {"CIM_DiagnosticSettingData"},                                     ""},
    {"PortAvailability",       "uint16",   "2",     {"CIM_FCPort"},                                                    "KALDERA_FCPort"},
    {"Primordial",             "boolean",  "false", {"CIM_StorageExtent"},                                             "KALDERA_StorageExtent"},
    {"QueryTimeout",           "uint32",   "0",     {"CIM_DiagnosticSettingData"},                                     ""},
    {"RemovalConditions",      "uint16",   "2",     {"CIM_PhysicalPackage"},                                           "KALDERA_PhysicalPackage"},
    {"RequestedState",         "uint16",   "12",    {"CIM_EnabledLogicalElement", "KALDERA_LANEndpoint"},              "KALDERA_ComputerSystem"},
    {"SampleInterval",         "datetime", "00000000000000.000000:000", {"CIM_StatisticalData"},                       "KALDERA_FCPortStatistics"},
    {"TimeBeforeRemoval",      "datetime", "00000000000500.000000:000", {"CIM_ConcreteJob", "KALDERA_ConcreteJob"},    ""},
    {"TransitioningToState",   "uint16",   "12",    {"CIM_EnabledLogicalElement"},                                     "KALDERA_TapeDrive"},
};
// clang-format on

/// The cell's value as text, or "null"; read from the instance, not from the table.
std::string cell(const Instance* instance, const Meta_Property& property)
{
    const char* const at = reinterpret_cast<const char*>(instance) + property.offset;
    if (at[type_size[property.type]])
        return "null";
    switch (property.type) {
    case BOOLEAN:
        return *reinterpret_cast<const boolean*>(at) ? "true" : "false";
    case UINT16:
        return std::to_string(*reinterpret_cast<const uint16*>(at));
    case UINT32:
        return std::to_string(*reinterpret_cast<const uint32*>(at));
    case DATETIME:
        return reinterpret_cast<const Datetime*>(at)->ascii().c_str();
    default:
        return "a type without a default";
    }
}

std::string created(const std::string& class_name, const char* name, bool defaults = true)
{
    const Meta_Class& meta_class = find(class_name);
    Instance* const instance = create(&meta_class, defaults);
    const std::string text =
        cell(instance, as_property(*meta_class.meta_features[position(meta_class, name)]));
    unref(instance);
    return text;
}

TEST(Defaults, AreFoundInFreshInstancesOfTheirClassesAndHeirs)
{
    ASSERT_EQ(std::size(rows), 23u);
    for (const Default_Row& row : rows) {
        SCOPED_TRACE(row.property);
        for (const char* name : row.declaring) {
            const Meta_Class& meta_class = find(name);
            const uint32 at = position(meta_class, row.property);
            EXPECT_EQ(type(*meta_class.meta_features[at]), row.type);
            EXPECT_EQ(meta_class.locals[at], 1);
            EXPECT_EQ(created(name, row.property), row.value) << name;
        }
        if (!row.heir.empty()) {
            EXPECT_EQ(created(row.heir, row.property), row.value) << row.heir;
        }
    }
}

// Each row names every class that states the default, and no other property has one.
TEST(Defaults, NoOtherPropertyHasOne)
{
    std::map<std::string, std::set<std::string>> expected, found;
    for (const Default_Row& row : rows)
        expected[row.property].insert(row.declaring.begin(), row.declaring.end());
    for (const Meta_Class* meta_class : classes())
        for (uint32 i = 0; i < meta_class->num_meta_features; i++) {
            const Meta_Feature& feature = *meta_class->meta_features[i];
            const std::string value = default_text(feature);
            if (value.empty() || !meta_class->locals[i])
                continue;
            // An override that states none shares the record of the class that does.
            const Meta_Class* superclass = meta_class->super_meta_class;
            const bool inherits =
                superclass && i < superclass->num_meta_features &&
                as_property(*superclass->meta_features[i]).value == as_property(feature).value;
            if (!inherits)
                found[feature.name].insert(meta_class->name);
        }
    EXPECT_EQ(found, expected);
}

TEST(Defaults, EveryEnabledLogicalElementHasItsFourStates)
{
    const Meta_Class& enabled = find("CIM_EnabledLogicalElement");
    int count = 0;
    for (const Meta_Class* meta_class : classes()) {
        if (!is_subclass(&enabled, meta_class))
            continue;
        count++;
        EXPECT_EQ(created(meta_class->name, "EnabledState"), "5") << meta_class->name;
        EXPECT_EQ(created(meta_class->name, "RequestedState"), "12") << meta_class->name;
        EXPECT_EQ(created(meta_class->name, "EnabledDefault"), "2") << meta_class->name;
        EXPECT_EQ(created(meta_class->name, "TransitioningToState"), "12") << meta_class->name;
    }
    EXPECT_GE(count, 40);
}

TEST(Defaults, OfDisksAndExtents)
{
    auto* const disk = create<KALDERA_LogicalDisk>(true);
    EXPECT_EQ(disk->NameFormat.null, 0);
    EXPECT_EQ(disk->NameFormat.value, 12);
    EXPECT_EQ(disk->NameNamespace.null, 0);
    EXPECT_EQ(disk->NameNamespace.value, 8);
    unref(disk);
    auto* const extent = create<KALDERA_StorageExtent>(true);
    EXPECT_EQ(extent->NameFormat.null, 0);
    EXPECT_EQ(extent->NameFormat.value, 12);
    EXPECT_EQ(extent->NameNamespace.null, 1);
    unref(extent);
}

TEST(Defaults, WithoutThemEveryCellIsZeroAndNotNull)
{
    EXPECT_EQ(created("KALDERA_FCPort", "EnabledState", false), "0");
    EXPECT_EQ(created("KALDERA_FCPort", "PortAvailability", false), "0");
    EXPECT_EQ(created("KALDERA_FCPort", "PortType"), "null");
}

TEST(Defaults, EveryClassCanBeCreatedAndReleased)
{
    for (const Meta_Class* meta_class : classes())
        for (const bool defaults : {false, true}) {
            Instance* const instance = create(meta_class, defaults);
            EXPECT_EQ(instance->__meta_class, meta_class);
            Instance* const copy = clone(instance);
            EXPECT_TRUE(identical(instance, copy)) << meta_class->name;
            unref(copy);
            unref(instance);
        }
}

} // namespace

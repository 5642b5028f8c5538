#include "module/runtime/objects/Instance.h"

#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

#include <set>
#include <string>

namespace KPRV {

namespace {

/// Names of the properties that the filter left selected.
std::set<std::string> selected(const Instance* instance)
{
    std::set<std::string> result;
    for_each_null_byte(instance, [&](const Meta_Feature* feature, uint8 null) {
        if (!null)
            result.insert(feature->name);
    });
    return result;
}

using Name_Set = std::set<std::string>;
const Name_Set ALL_OF_PORT = {"Name",  "EnabledState", "Caption", "Timeout", "Codes",
                              "Words", "Pauses",       "Number",  "Load"};

} // namespace

TEST(Instance_set_null_flags, ReachesTheChosenProperties)
{
    const Ref<Sample_Port> x(create<Sample_Port>(false));
    EXPECT_EQ(ALL_OF_PORT, selected(x.ptr()));
    __set_null_flags(x.ptr(), false, true, 1);
    EXPECT_EQ((Name_Set{"Name", "Number"}), selected(x.ptr()));
    __set_null_flags(x.ptr(), true, false, 1);
    EXPECT_EQ(Name_Set{}, selected(x.ptr()));
    __set_null_flags(x.ptr(), false, false, 0);
    EXPECT_EQ(Name_Set{}, selected(x.ptr()));
    __set_null_flags(x.ptr(), true, true, 0);
    EXPECT_EQ(ALL_OF_PORT, selected(x.ptr()));
}

TEST(Instance_set_null_flags, LeavesReferencesAlone)
{
    const Ref<Sample_Group> x = make_group("g");
    __set_null_flags(x.ptr(), true, true, 1);
    EXPECT_EQ(1, x->Name.null);
    EXPECT_NE(nullptr, x->Leader);
    EXPECT_EQ(0, x->Members.null);
}

TEST(Instance_filter_properties, NoListSelectsAll)
{
    for (bool keep_keys : {false, true}) {
        const Ref<Sample_Port> x(create<Sample_Port>(true));
        EXPECT_EQ(0, filter_properties(x.ptr(), nullptr, keep_keys));
        EXPECT_EQ(ALL_OF_PORT, selected(x.ptr()));
    }
}

TEST(Instance_filter_properties, AnEmptyListSelectsKeysWhenTheyAreKept)
{
    const char* const names[] = {nullptr};
    const Ref<Sample_Port> x(create<Sample_Port>(false));
    EXPECT_EQ(0, filter_properties(x.ptr(), names, true));
    EXPECT_EQ((Name_Set{"Name", "Number"}), selected(x.ptr()));
    EXPECT_EQ(0, filter_properties(x.ptr(), names, false));
    EXPECT_EQ(Name_Set{}, selected(x.ptr()));
}

TEST(Instance_filter_properties, SelectsTheNamedInAnyCaseAndSkipsTheUnknown)
{
    const char* const names[] = {"words", "Unknown", "LOAD", "", nullptr};
    const Ref<Sample_Port> x(create<Sample_Port>(false));
    EXPECT_EQ(0, filter_properties(x.ptr(), names, true));
    EXPECT_EQ((Name_Set{"Name", "Number", "Words", "Load"}), selected(x.ptr()));
}

// Keys follow keep_keys alone.
TEST(Instance_filter_properties, ANamedKeyIsNotSelected)
{
    const char* const names[] = {"Name", nullptr};
    const Ref<Sample_Port> x(create<Sample_Port>(false));
    EXPECT_EQ(0, filter_properties(x.ptr(), names, false));
    EXPECT_EQ(Name_Set{}, selected(x.ptr()));
}

TEST(Instance_filter_properties, AMethodEndsTheWalk)
{
    const char* const names[] = {"Load", "Reset", "Words", nullptr};
    const Ref<Sample_Port> x(create<Sample_Port>(false));
    EXPECT_EQ(-1, filter_properties(x.ptr(), names, true));
    EXPECT_EQ((Name_Set{"Name", "Number", "Load"}), selected(x.ptr()));
}

TEST(Instance_filter_properties, ANamedReferenceIsCreated)
{
    const char* const names[] = {"leader", "members", nullptr};
    const Ref<Sample_Group> x(create<Sample_Group>(false));
    x->Members.null = 1;
    EXPECT_EQ(0, filter_properties(x.ptr(), names, true));
    ASSERT_NE(nullptr, x->Leader);
    EXPECT_EQ(&Sample_Element::static_meta_class, x->Leader->__meta_class);
    // Without defaults.
    EXPECT_EQ(0, static_cast<Sample_Element*>(x->Leader)->EnabledState.value);
    EXPECT_EQ(0, x->Members.null);
    const Instance* before = x->Leader;
    EXPECT_EQ(0, filter_properties(x.ptr(), names, true));
    EXPECT_EQ(before, x->Leader);
}

} // namespace KPRV

#include "module/runtime/objects/Class_Plan.h"

#include "module/runtime/objects/Ref.h"
#include "module/runtime/objects/Value.h"
#include "module/runtime/objects/meta_build.h"
#include "module/runtime/objects/meta_destroy.h"
#include "tests/module/runtime/objects/sample_classes.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <thread>
#include <vector>

namespace KPRV {

static std::vector<const Meta_Feature*> features_in(std::span<const Cell> cells)
{
    std::vector<const Meta_Feature*> features;
    for (const Cell& cell : cells)
        features.push_back(cell.feature);
    return features;
}

TEST(Class_Plan, ItsGroupsAreTheFeaturesInTheirOrder)
{
    for (uint32 i = 0; i < sample_repository.num_meta_classes; i++) {
        const Meta_Class* const meta_class = sample_repository.meta_classes[i];
        SCOPED_TRACE(meta_class->name);
        std::vector<const Meta_Feature*> all, keys, non_keys, holders;
        for (const Meta_Feature* feature : features_of(meta_class)) {
            const Value::Type type = type_of(feature);
            if (type == Value::NONE)
                continue;
            all.push_back(feature);
            (feature->flags & FLAG_KEY ? keys : non_keys).push_back(feature);
            if (type >= int(STRING))
                holders.push_back(feature);
        }
        const Class_Plan* const plan = plan_of(meta_class);
        ASSERT_NE(nullptr, plan);
        EXPECT_EQ(all, features_in((*plan)[Cells::ALL]));
        EXPECT_EQ(keys, features_in((*plan)[Cells::KEYS]));
        EXPECT_EQ(non_keys, features_in((*plan)[Cells::NON_KEYS]));
        EXPECT_EQ(holders, features_in((*plan)[Cells::HOLDERS]));
        EXPECT_EQ(plan, plan_of(meta_class));
    }
}

TEST(Class_Plan, ACellSaysWhatItsRecordSays)
{
    for (const Meta_Feature* feature : features_of(&Sample_Types::static_meta_class)) {
        const Cell cell = cell_of(feature);
        const auto* const meta = static_cast<const Meta_Property*>(feature);
        EXPECT_EQ(meta->offset, cell.offset());
        EXPECT_EQ(null_offset(meta), cell.size);
        EXPECT_EQ(type_of(feature), cell.type);
    }
    for (const Meta_Feature* feature : features_of(&Sample_Group::static_meta_class)) {
        EXPECT_EQ(type_of(feature), cell_of(feature).type) << feature->name;
    }
}

TEST(Class_Plan, ACellKnowsWhenItIsNull)
{
    const Ref<Sample_Group> group(create<Sample_Group>(false));
    for (const Meta_Feature* feature : features_of(&Sample_Group::static_meta_class)) {
        const Value::Type type = type_of(feature);
        if (type == Value::NONE)
            continue;
        EXPECT_EQ(type == Value::INSTANCE, cell_of(feature).is_null(group.ptr())) << feature->name;
    }
    clear(group.ptr());
    visit_cells(&Sample_Group::static_meta_class, Cells::ALL,
                [&](const Cell& cell) { EXPECT_TRUE(cell.is_null(group.ptr())) << cell.feature->name; });
    group->Leader = create<Sample_Group>(false);
    visit_cells(&Sample_Group::static_meta_class, Cells::ALL, [&](const Cell& cell) {
        EXPECT_EQ(cell.kind != Cell_Kind::REFERENCE, cell.is_null(group.ptr())) << cell.feature->name;
    });
}

TEST(Class_Plan, WhatIsMadeAtRunTimeHasNoneAndIsWalkedAllTheSame)
{
    const Meta_Class* const ported = &Sample_Types::static_meta_class;
    Meta_Class* const made = create_meta_class("Made", ported, 0);
    EXPECT_EQ(nullptr, plan_of(made));
    std::vector<const Meta_Feature*> walked;
    visit_cells(made, Cells::HOLDERS, [&](const Cell& cell) { walked.push_back(cell.feature); });
    EXPECT_EQ(plan_of(ported)->groups[static_cast<size_t>(Cells::HOLDERS)].size(), walked.size());
    destroy(made);
    EXPECT_EQ(nullptr, plan_of(&Instance::static_meta_class));
}

TEST(Class_Plan, CellsAreAskedFromTheLastOnUntilOneDenies)
{
    Meta_Class* const made = create_meta_class("Made", &Sample_Types::static_meta_class, 0);
    for (const Meta_Class* meta_class :
         {&Sample_Types::static_meta_class, static_cast<const Meta_Class*>(made)}) {
        std::vector<const Meta_Feature*> forwards, backwards;
        visit_cells(meta_class, Cells::ALL, [&](const Cell& cell) { forwards.push_back(cell.feature); });
        EXPECT_TRUE(all_cells(meta_class, Cells::ALL, [&](const Cell& cell) {
            backwards.push_back(cell.feature);
            return true;
        }));
        std::reverse(backwards.begin(), backwards.end());
        EXPECT_EQ(forwards, backwards);
        size_t asked = 0;
        EXPECT_FALSE(all_cells(meta_class, Cells::HOLDERS, [&](const Cell&) { return ++asked < 2; }));
        EXPECT_EQ(2u, asked);
    }
    destroy(made);
}

TEST(Class_Plan, AnotherRecordInTheSamePlaceIsNotTakenForTheFirst)
{
    Meta_Class record = Sample_Types::static_meta_class;
    ASSERT_NE(nullptr, plan_of(&record));
    record.meta_features = Sample_Group::static_meta_class.meta_features;
    record.num_meta_features = Sample_Group::static_meta_class.num_meta_features;
    EXPECT_EQ(nullptr, plan_of(&record));
}

TEST(Class_Plan, ThreadsThatAskAtOnceGetTheSame)
{
    // Records of their own, that nobody has asked for.
    static std::vector<Meta_Class> records(40, Sample_Types::static_meta_class);
    std::vector<const Class_Plan*> seen[2];
    {
        std::vector<std::jthread> threads;
        for (auto& plans : seen)
            threads.emplace_back([&plans] {
                for (const Meta_Class& record : records)
                    plans.push_back(plan_of(&record));
            });
    }
    EXPECT_EQ(seen[0], seen[1]);
    EXPECT_EQ(0, std::count(seen[0].begin(), seen[0].end(), nullptr));
}

} // namespace KPRV

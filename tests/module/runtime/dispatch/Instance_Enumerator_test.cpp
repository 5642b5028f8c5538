#include "module/runtime/dispatch/Instance_Enumerator.h"
#include "module/runtime/dispatch/cimom.h"
#include "tests/module/runtime/dispatch/Recording_Context.h"
#include "tests/module/runtime/dispatch/Scripted_Provider.h"

#include <gtest/gtest.h>

using namespace KPRV;

TEST(Instance_Enumerator, IsAtItsEndBeforeItIsUsed)
{
    Notes notes;
    Recording_Context context(notes);
    const Pushed pushed(&context);
    Instance_Enumerator enumerator;
    EXPECT_FALSE(enumerator);
    EXPECT_FALSE(enumerator());
}

TEST(Instance_Enumerator, WalksThroughTheContextAndGivesTheRepBack)
{
    const Ref<Instance> model(make_named("model"));
    Notes notes;
    Recording_Context context(notes);
    const Pushed pushed(&context);
    context.results.emplace_back(make_named("second"));
    context.results.emplace_back(make_named("first"));
    std::vector<std::string> names;
    {
        Instance_Enumerator enumerator;
        ASSERT_EQ(cimom::enum_instances("ns", model.ptr(), enumerator), 0);
        for (; enumerator; enumerator++)
            names.push_back(name_of_sample(enumerator().ptr()));
        EXPECT_FALSE(enumerator());
    }
    EXPECT_EQ(names, (std::vector<std::string>{"first", "second"}));
    EXPECT_EQ(notes.list(), (Notes_List{"enum ns", "destroy"}));
}

TEST(Instance_Enumerator, HandsOutInstancesWithACountOfTheirOwn)
{
    const Ref<Instance> model(make_named("model"));
    Notes notes;
    Recording_Context context(notes);
    const Pushed pushed(&context);
    context.results.emplace_back(make_named("only"));
    Ref<Instance> kept;
    {
        Instance_Enumerator enumerator;
        ASSERT_EQ(cimom::enum_instances("ns", model.ptr(), enumerator), 0);
        kept = enumerator();
        enumerator++;
    }
    EXPECT_EQ(kept->__refs, 1);
    EXPECT_EQ(name_of_sample(kept.ptr()), "only");
}

TEST(Instance_Enumerator, WithoutAContextItDoesNothing)
{
    const Ref<Instance> model(make_named("model"));
    Notes notes;
    Recording_Context context(notes);
    {
        Instance_Enumerator enumerator;
        {
            const Pushed pushed(&context);
            context.results.push_back(model);
            ASSERT_EQ(cimom::enum_instances("ns", model.ptr(), enumerator), 0);
            EXPECT_TRUE(enumerator);
        }
        EXPECT_FALSE(enumerator);
        enumerator++;
        EXPECT_FALSE(enumerator());
    }
    EXPECT_EQ(notes.list(), Notes_List{"enum ns"}) << "the rep was out of reach";
    EXPECT_EQ(context.results.size(), 1u);
}

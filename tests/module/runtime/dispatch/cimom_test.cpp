#include "module/runtime/dispatch/cimom.h"
#include "tests/module/runtime/dispatch/Recording_Context.h"
#include "tests/module/runtime/dispatch/Scripted_Provider.h"

#include <gtest/gtest.h>
#include <unistd.h>

using namespace KPRV;

TEST(cimom, EverythingFailsQuietlyWithoutAContext)
{
    const Ref<Instance> model(make_named("a"));
    Instance_Enumerator enumerator;
    EXPECT_EQ(cimom::enum_instances("ns", model.ptr(), enumerator), -1);
    EXPECT_FALSE(cimom::get_instance("ns", model.ptr()));
    EXPECT_EQ(cimom::create_instance("ns", model.ptr()), -1);
    EXPECT_EQ(cimom::delete_instance("ns", model.ptr()), -1);
    EXPECT_EQ(cimom::modify_instance("ns", model.ptr()), -1);
    EXPECT_EQ(cimom::invoke_method("ns", model.ptr(), model.ptr()), -1);
    cimom::allow_unload(false);
    String name("kept");
    EXPECT_FALSE(cimom::get_username(name));
    EXPECT_EQ(name, "kept");
}

TEST(cimom, EverythingGoesToTheContextOnTop)
{
    const Ref<Instance> model(make_named("a"));
    Notes notes;
    Recording_Context below(notes, "below "), context(notes);
    const Pushed pushed_below(&below);
    const Pushed pushed(&context);
    context.results.push_back(model);
    context.status = -1;

    EXPECT_EQ(cimom::get_instance("ns", model.ptr()).ptr(), model.ptr());
    EXPECT_EQ(cimom::create_instance("ns", model.ptr()), -1);
    context.status = 0;
    EXPECT_EQ(cimom::delete_instance("ns", model.ptr()), 0);
    EXPECT_EQ(cimom::modify_instance("ns", model.ptr()), 0);
    EXPECT_EQ(cimom::invoke_method("ns", model.ptr(), model.ptr()), 0);
    cimom::allow_unload(false);
    cimom::allow_unload(true);
    String name;
    EXPECT_TRUE(cimom::get_username(name));
    EXPECT_EQ(name, "root");
    EXPECT_EQ(notes.list(), (Notes_List{"get ns", "create instance", "delete instance", "modify instance",
                                        "invoke", "refuse", "allow"}));
}

TEST(cimom, AnEnumeratorIsUsedAgainAfterItsRepIsDestroyed)
{
    const Ref<Instance> model(make_named("a"));
    Notes notes;
    Recording_Context context(notes);
    const Pushed pushed(&context);
    {
        Instance_Enumerator enumerator;
        EXPECT_EQ(cimom::enum_instances("one", model.ptr(), enumerator), 0);
        context.next_rep = nullptr;
        EXPECT_EQ(cimom::enum_instances("two", model.ptr(), enumerator), -1);
        EXPECT_FALSE(enumerator);
        EXPECT_EQ(cimom::enum_instances("three", model.ptr(), enumerator), -1);
    }
    EXPECT_EQ(notes.list(), (Notes_List{"enum one", "destroy", "enum two", "enum three"}));
}

TEST(cimom, EnumerationIntoAnArrayIsNotOffered)
{
    Array<Instance*> instances;
    EXPECT_EXIT(
        {
            dup2(STDERR_FILENO, STDOUT_FILENO);
            cimom::enum_instances("ns", nullptr, instances);
        },
        testing::KilledBySignal(SIGABRT), "^NOT IMPLEMENTED\\.\n.*assert: false\n\n$");
}

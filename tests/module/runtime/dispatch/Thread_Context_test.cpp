#include "module/runtime/dispatch/Thread_Context.h"
#include "tests/module/runtime/dispatch/Recording_Context.h"

#include <gtest/gtest.h>
#include <thread>

using namespace KPRV;

TEST(Thread_Context, AFreshThreadHasNone)
{
    Notes notes;
    Recording_Context context(notes);
    const Pushed pushed(&context);
    Thread_Context* seen = &context;
    std::thread([&] { seen = Thread_Context::top(); }).join();
    EXPECT_EQ(seen, nullptr);
    EXPECT_EQ(Thread_Context::top(), &context);
}

TEST(Thread_Context, IsAStackThatClearsTheLinkOfWhatItPops)
{
    Notes notes;
    Recording_Context first(notes), second(notes);
    Thread_Context::push(&first);
    Thread_Context::push(&second);
    EXPECT_EQ(Thread_Context::top(), &second);
    EXPECT_EQ(second.link(), static_cast<Thread_Context*>(&first));

    Thread_Context::pop();
    EXPECT_EQ(Thread_Context::top(), &first);
    EXPECT_EQ(second.link(), nullptr);
    Thread_Context::pop();
    EXPECT_EQ(Thread_Context::top(), nullptr);
    Thread_Context::pop();
    EXPECT_EQ(Thread_Context::top(), nullptr);
}

TEST(Thread_Context, DoesNotOwnWhatIsOnTheStack)
{
    Notes notes;
    {
        Recording_Context context(notes);
        const Pushed pushed(&context);
    }
    EXPECT_EQ(notes.list(), Notes_List{"gone"});
}

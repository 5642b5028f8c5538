#include "module/runtime/dispatch/Thread.h"
#include "tests/module/runtime/dispatch/Recording_Context.h"

#include <array>
#include <atomic>
#include <cerrno>
#include <cstring>
#include <gtest/gtest.h>
#include <thread>

using namespace KPRV;

static void* add_one(void* argument)
{
    return static_cast<char*>(argument) + 1;
}

static Notes* body_notes;

static void* note_body(void* argument)
{
    body_notes->add("body");
    *static_cast<Thread_Context**>(argument) = Thread_Context::top();
    return nullptr;
}

TEST(Thread, JoinGivesTheResult)
{
    char place[2];
    Thread thread;
    ASSERT_EQ(Thread::create_joinable(thread, add_one, place), 0);
    void* result = nullptr;
    EXPECT_EQ(Thread::join(thread, result), 0);
    EXPECT_EQ(result, place + 1);
}

TEST(Thread, JoinClearsTheResultBeforeItFails)
{
    int place;
    void* result = &place;
    EXPECT_EQ(Thread::join(Thread::self(), result), EDEADLK);
    EXPECT_EQ(result, nullptr);
}

TEST(Thread, CopiesNameTheSameThread)
{
    const Thread self = Thread::self();
    Thread assigned;
    EXPECT_FALSE(Thread::equal(assigned, self));
    assigned = self;
    EXPECT_TRUE(Thread::equal(assigned, self));
    EXPECT_TRUE(Thread::equal(Thread(assigned), Thread::self()));
}

TEST(Thread, KeepsTheHandleInItsFirstWord)
{
    const Thread self = Thread::self();
    const auto* const words = reinterpret_cast<const uint64*>(&self);
    EXPECT_EQ(memcmp(words, std::array{pthread_self()}.data(), sizeof(pthread_t)), 0);
    EXPECT_EQ(words[1], 0u);
    EXPECT_EQ(words[3], 0u);
}

TEST(Thread, WithoutAContextItOnlyRunsTheFunction)
{
    Notes notes;
    body_notes = &notes;
    Thread_Context* seen = reinterpret_cast<Thread_Context*>(&notes);
    Thread thread;
    ASSERT_EQ(Thread::create_joinable(thread, note_body, &seen), 0);
    void* result;
    Thread::join(thread, result);
    EXPECT_EQ(seen, nullptr);
    EXPECT_EQ(notes.list(), Notes_List{"body"});
}

TEST(Thread, WithAContextItGetsOneOfItsOwnAndRunsTheHooks)
{
    Notes notes;
    body_notes = &notes;
    Recording_Context parent(notes);
    const Pushed pushed(&parent);
    Thread_Context* seen = nullptr;
    Thread thread;
    ASSERT_EQ(Thread::create_joinable(thread, note_body, &seen), 0);
    void* result;
    Thread::join(thread, result);
    EXPECT_EQ(seen, parent.child);
    EXPECT_NE(seen, &parent);
    EXPECT_EQ(notes.list(), (Notes_List{"create", "child start", "body", "child exit", "child gone"}));
    EXPECT_EQ(Thread_Context::top(), &parent);
}

static void* raise_flag(void* argument)
{
    static_cast<std::atomic<bool>*>(argument)->store(true);
    return nullptr;
}

TEST(Thread, ADetachedOneRunsAndCannotBeJoined)
{
    std::atomic<bool> flag = false;
    Thread thread;
    ASSERT_EQ(Thread::create_detached(thread, raise_flag, &flag), 0);
    while (!flag)
        std::this_thread::yield();
    // Its stack may be gone by now, so there is nothing to join; that it ran is what counts.
    SUCCEED();
}

static void* leave_early(void*)
{
    Thread::exit(body_notes);
}

TEST(Thread, ExitRunsTheHookButKeepsTheContext)
{
    Notes notes;
    body_notes = &notes;
    Recording_Context parent(notes);
    const Pushed pushed(&parent);
    Thread thread;
    ASSERT_EQ(Thread::create_joinable(thread, leave_early, nullptr), 0);
    void* result = nullptr;
    Thread::join(thread, result);
    EXPECT_EQ(result, &notes);
    EXPECT_EQ(notes.list(), (Notes_List{"create", "child start", "child exit"}));
    delete parent.child;
}

TEST(Thread, ExitWithoutAContextOnlyEndsTheThread)
{
    Notes notes;
    body_notes = &notes;
    Thread thread;
    ASSERT_EQ(Thread::create_joinable(thread, leave_early, nullptr), 0);
    void* result = nullptr;
    Thread::join(thread, result);
    EXPECT_EQ(result, &notes);
    EXPECT_TRUE(notes.list().empty());
}

/// Makes every thread creation with default attributes fail: no such stack can be had.
class Huge_Stacks
{
public:
    Huge_Stacks()
    {
        pthread_attr_init(&_old);
        pthread_getattr_default_np(&_old);
        pthread_attr_t huge;
        pthread_attr_init(&huge);
        pthread_attr_setstacksize(&huge, sizeof(size_t) == 4 ? size_t(0xF0000000) : size_t(1) << 46 << 1);
        pthread_setattr_default_np(&huge);
        pthread_attr_destroy(&huge);
    }
    ~Huge_Stacks()
    {
        pthread_setattr_default_np(&_old);
        pthread_attr_destroy(&_old);
    }
    Huge_Stacks(const Huge_Stacks&) = delete;
    Huge_Stacks& operator=(const Huge_Stacks&) = delete;

private:
    pthread_attr_t _old;
};

TEST(Thread, FailingCreationDeletesTheContextOfTheParent)
{
    Notes notes;
    Recording_Context* child = nullptr;
    // On a thread of its own, whose stack of contexts goes with it.
    std::thread([&] {
        const Huge_Stacks huge_stacks;
        auto* const parent = new Recording_Context(notes);
        parent->child_at = &child;
        Thread_Context::push(parent);
        Thread thread;
        const int status = Thread::create_joinable(thread, add_one, nullptr);
        EXPECT_EQ(status, EAGAIN);
        EXPECT_EQ(Thread_Context::top(), parent) << "the deleted one stays on the stack";
        EXPECT_TRUE(Thread::equal(thread, Thread()));
    }).join();
    EXPECT_EQ(notes.list(), (Notes_List{"create", "gone"})) << "and the new thread's one is not released";
    delete child;
}

TEST(Thread, FailingCreationWithoutAContextGivesTheError)
{
    const Huge_Stacks huge_stacks;
    Thread thread;
    EXPECT_EQ(Thread::create_detached(thread, add_one, nullptr), EAGAIN);
}

static void* push_and_leave(void* argument)
{
    Thread_Context::push(static_cast<Thread_Context*>(argument));
    return nullptr;
}

TEST(Thread, AContextLeftOnTheStackIsFatal)
{
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    Notes notes;
    Recording_Context context(notes);
    EXPECT_EXIT(
        {
            Thread thread;
            Thread::create_joinable(thread, push_and_leave, static_cast<Thread_Context*>(&context));
            void* result;
            Thread::join(thread, result);
        },
        testing::KilledBySignal(SIGABRT), "assert: context == Thread_Context::top\\(\\)\n\n$");
}

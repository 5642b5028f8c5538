#include "module/runtime/dispatch/Request_Scope.h"

#include <gtest/gtest.h>

#include <thread>

using namespace KPRV;

TEST(Request_Scope, IsTheThreadsUntilItsEnd)
{
    EXPECT_EQ(Request_Scope::current(), nullptr);
    {
        const Request_Scope request;
        EXPECT_EQ(Request_Scope::current(), &request);
        std::thread([] { EXPECT_EQ(Request_Scope::current(), nullptr); }).join();
    }
    EXPECT_EQ(Request_Scope::current(), nullptr);
}

TEST(Request_Scope, TakesInWhatTheServerAsksMeanwhile)
{
    const Request_Scope request;
    {
        const Request_Scope inner;
        EXPECT_EQ(Request_Scope::current(), &request);
    }
    EXPECT_EQ(Request_Scope::current(), &request);
}

TEST(Request_Scope, GivesItsNotesBackAtItsEnd)
{
    struct Note : Request_Scope::Note
    {
        explicit Note(bool& gone) : _gone(gone) {}
        ~Note() override { _gone = true; }
        bool& _gone;
    };
    bool gone = false;
    {
        Request_Scope request;
        request.host = std::make_unique<Note>(gone);
        EXPECT_FALSE(gone);
    }
    EXPECT_TRUE(gone);
}

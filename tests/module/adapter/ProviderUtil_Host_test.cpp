#include "module/adapter/ProviderUtil.h"

#include "module/adapter/Host_Calls.h"
#include "module/adapter/Host_Name.h"
#include "tests/support/Eventually.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

#include <arpa/inet.h>

#include <atomic>
#include <cerrno>
#include <chrono>
#include <condition_variable>
#include <cstring>
#include <functional>
#include <mutex>
#include <thread>

using namespace KPRV;

namespace {

constexpr const char* BY_NAME =
    "INFO gethostbyname() FAILED. hostString will have hostname instead of ipAddress";

/// A host as the operating system would describe it.
struct ProviderUtil_Host : testing::Test
{
    ProviderUtil_Host()
    {
        current = this;
        host_calls = {
            [](char* out, size_t size) { return current->tell(current->name, out, size); },
            [](char* out, size_t size) { return current->tell(current->domain, out, size); },
            [](const char*, hostent* entry, char* room, size_t size, hostent** found, int*) {
                return current->look_up(entry, room, size, found);
            },
            [](utsname* out) {
                strcpy(out->nodename, "node");
                return current->uname_result;
            },
        };
    }
    ~ProviderUtil_Host() override { host_calls = old; }

    /// A null text is a failing call; so is one more call than allowed.
    int tell(const char* text, char* out, size_t size)
    {
        if (!text || (text == name && names_left-- == 0))
            return -1;
        strncpy(out, text, size);
        return 0;
    }
    /// Writes all that it finds into the caller's room.
    int look_up(hostent* entry, char* room, size_t size, hostent** found)
    {
        if (wanted_room)
            rooms.push_back(size);
        *found = nullptr;
        const size_t count = addresses.size();
        if (size < wanted_room)
            return ERANGE;
        if (on_look_up)
            on_look_up();
        if (!resolves)
            return 0;
        char** const pointers = reinterpret_cast<char**>(room);
        char* const words = room + (count + 1) * sizeof(char*);
        for (size_t i = 0; i < count; i++)
            pointers[i] =
                static_cast<char*>(memcpy(words + i * sizeof(in_addr), &addresses[i], sizeof(in_addr)));
        pointers[count] = nullptr;
        *entry = {nullptr, nullptr, AF_INET, sizeof(in_addr), pointers};
        *found = entry;
        return 0;
    }
    void has(std::initializer_list<const char*> texts)
    {
        addresses.clear();
        for (const char* text : texts)
            addresses.push_back({inet_addr(text)});
    }

    static inline ProviderUtil_Host* current;
    const Host_Calls old = host_calls;
    const char* name = "alpha";
    std::atomic<int> names_left = 9;
    const char* domain = "example.org";
    bool resolves = true;
    int uname_result = 0;
    std::vector<in_addr> addresses;
    /// What an answer takes, and what was offered for it.
    size_t wanted_room = 0;
    std::vector<size_t> rooms;
    std::function<void()> on_look_up;
    Log_Capture log;
    char buffer[64] = "left over";
};

} // namespace

TEST_F(ProviderUtil_Host, FirstAddressThatIsNoLoopback)
{
    has({"127.0.0.1", "10.1.2.3", "192.168.0.1"});
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, sizeof buffer), 0);
    EXPECT_STREQ(buffer, "10.1.2.3");
    EXPECT_EQ(log.said(), Lines{});
    EXPECT_EQ(log.traces(), (Lines{"DBG Entering: getHostInfo", "DBG Returning: getHostInfo"}));
}

TEST_F(ProviderUtil_Host, WithoutANameItIsLocalhost)
{
    name = nullptr;
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, sizeof buffer), 3);
    EXPECT_STREQ(buffer, "localhost");
    EXPECT_EQ(log.said(), Lines{"INFO gethostname() FAILED. hostString will be filled with localhost"});
}

TEST_F(ProviderUtil_Host, WithoutAnAddressItIsTheName)
{
    resolves = false;
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, sizeof buffer), 2);
    EXPECT_STREQ(buffer, "alpha");
    resolves = true;
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, sizeof buffer), 2);
    EXPECT_STREQ(buffer, "alpha");
    EXPECT_EQ(log.said(), Lines(2, BY_NAME));
}

TEST_F(ProviderUtil_Host, WithLoopbackAddressesAloneItIsTheBareName)
{
    has({"127.0.0.1", "127.0.1.1"});
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, sizeof buffer), 2);
    EXPECT_STREQ(buffer, "alpha");
    EXPECT_EQ(log.said(), Lines{BY_NAME});
    // Also where the text of the name is localhost and there is no domain: the domain is part of what is
    // compared.
    name = "localhost";
    domain = "(none)";
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, sizeof buffer), 2);
    EXPECT_STREQ(buffer, "localhost");
}

TEST_F(ProviderUtil_Host, OneWalkAsksOnceAndTellsEachTime)
{
    resolves = false;
    names_left = 1;
    Host_Name host(64);
    for (int i = 0; i < 3; i++)
        EXPECT_STREQ(host.get().c_str(), "alpha");
    EXPECT_EQ(log.said(), Lines(3, BY_NAME));
    EXPECT_EQ(log.traces().size(), 6u);
    EXPECT_EQ(log.traces()[4], "DBG Entering: getHostInfo");
}

TEST_F(ProviderUtil_Host, AWalkCutsTheNameToItsRoom)
{
    has({"10.1.2.3"});
    EXPECT_STREQ(Host_Name(5).get().c_str(), "10.1");
    EXPECT_STREQ(Host_Name(256).get().c_str(), "10.1.2.3");
}

TEST_F(ProviderUtil_Host, ANameThatIsLostInBetween)
{
    has({"127.0.0.1"});
    names_left = 1;
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, sizeof buffer), 2);
    EXPECT_EQ(log.said(), Lines{"INFO gethostname() failed"});
}

TEST_F(ProviderUtil_Host, WithoutADomainCallItIsTheBareName)
{
    has({"127.0.0.1"});
    domain = nullptr;
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, sizeof buffer), 2);
    EXPECT_STREQ(buffer, "alpha");
    EXPECT_EQ(log.said(), Lines{"INFO getdomainname() failed"});
}

TEST_F(ProviderUtil_Host, NoDomainCountsWhereItDoesNotFit)
{
    has({"127.0.0.1"});
    name = "localhost";
    domain = "(none)";
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, sizeof "localhost"), 4);
    EXPECT_STREQ(buffer, "localhost");
    EXPECT_EQ(log.said(), Lines{});
}

TEST_F(ProviderUtil_Host, NothingIsWrittenBeyondTheBuffer)
{
    has({"10.1.2.3"});
    memset(buffer, '#', sizeof buffer);
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, 5), 0);
    EXPECT_STREQ(buffer, "10.1");
    EXPECT_EQ(buffer[5], '#');
    resolves = false;
    const std::string long_name(300, 'n');
    name = long_name.c_str();
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, 8), 2);
    EXPECT_STREQ(buffer, "nnnnnnn");
    buffer[0] = '#';
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, 0), 2);
    EXPECT_EQ(buffer[0], '#');
}

TEST_F(ProviderUtil_Host, ALongAnswerGetsMoreRoom)
{
    has({"127.0.0.1", "10.1.2.3"});
    wanted_room = 40000;
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, sizeof buffer), 0);
    EXPECT_STREQ(buffer, "10.1.2.3");
    EXPECT_EQ(rooms, (std::vector<size_t>{1024, 4096, 16384, 65536}));
    // An answer without end is none.
    wanted_room = ~size_t(0);
    rooms.clear();
    EXPECT_EQ(ProviderUtil::getHostInfo(buffer, sizeof buffer), 2);
    EXPECT_STREQ(buffer, "alpha");
    EXPECT_EQ(rooms.back(), size_t(1) << 20);
    EXPECT_EQ(log.said(), Lines{BY_NAME});
}

// A slow name server holds up who asks it, and nobody else.
TEST_F(ProviderUtil_Host, LookUpsDoNotWaitForEachOther)
{
    has({"10.1.2.3"});
    std::mutex mutex;
    std::condition_variable came;
    int inside = 0;
    bool all_inside = true;
    constexpr int THREADS = 8;
    on_look_up = [&] {
        std::unique_lock lock(mutex);
        inside++;
        came.notify_all();
        all_inside &= came.wait_for(lock, PATIENCE, [&] { return inside == THREADS; });
    };
    std::vector<std::string> names(THREADS);
    {
        std::vector<std::jthread> threads;
        for (std::string& each : names)
            threads.emplace_back([&each] {
                char text[64] = {};
                ProviderUtil::getHostInfo(text, sizeof text);
                each = text;
            });
    }
    EXPECT_TRUE(all_inside) << "they were let in one by one";
    EXPECT_EQ(names, std::vector<std::string>(THREADS, "10.1.2.3"));
}

TEST_F(ProviderUtil_Host, NodeName)
{
    EXPECT_TRUE(ProviderUtil::getHostName() == "node");
    EXPECT_EQ(log.said(), Lines{});
    uname_result = -3;
    EXPECT_TRUE(ProviderUtil::getHostName() == "localhost");
    EXPECT_EQ(log.said(), Lines{"ERR uname() returned error = -3"});
}

TEST_F(ProviderUtil_Host, APathAsAClientSeesIt)
{
    has({"10.1.2.3"});
    EXPECT_TRUE(ProviderUtil::updateNamespacePath("KALDERA_FCPort.DeviceID=\"a\"") ==
                "//10.1.2.3/root/kaldera:KALDERA_FCPort.DeviceID=\"a\"");
}

#include "module/adapter/Ethernet_Port_Query.h"

#include "tests/support/Fake_Library.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

using namespace KPRV;

namespace {

struct Ethernet_Port_Query : testing::Test
{
    Fake_Library library;
    Log_Capture log;
    Json::Value out;

    int query(const char* mac = "8c7cff000001") { return query_ethernet_port(LOG_HERE, mac, out); }
};

} // namespace

TEST_F(Ethernet_Port_Query, AsksByMacInIndexForm)
{
    library.answers("getEthPortByEthMac", json("{'ethData': {'ethDev': 'eth0'}}"));
    EXPECT_EQ(query(), 0);
    EXPECT_EQ(out["ethData"]["ethDev"], "eth0");
    EXPECT_EQ(library.told(), Lines{R"(getEthPortByEthMac {"mac":"8c:7c:ff:00:00:01"})"});
    EXPECT_EQ(log.said(), Lines{});
    EXPECT_EQ(log.traces(), (Lines{"DBG Entering: getEthPortDetails", "DBG Returning: getEthPortDetails"}));
}

TEST_F(Ethernet_Port_Query, ABadAnswerIsMinus1)
{
    for (const char* answer : {"null", "{}", "[]", "{'ethData': 5}", "{'ethData': {}, 'error': 0}"}) {
        library.answers("getEthPortByEthMac", json(answer));
        EXPECT_EQ(query(), -1) << answer;
    }
    EXPECT_EQ(log.said(), Lines(5, "ERR Ethernet Port Info is NOT available"));
    EXPECT_EQ(log.lines()[0].file, "Ethernet_Port_Query_test.cpp");
}

TEST_F(Ethernet_Port_Query, AnExceptionIsMinus1)
{
    library.throws("getEthPortByEthMac", HbaAgentError{7, "busy"});
    EXPECT_EQ(query(), -1);
    library.throws("getEthPortByEthMac", std::runtime_error("broken"));
    EXPECT_EQ(query(), -1);
    library.throws("getEthPortByEthMac", 5);
    EXPECT_EQ(query(), -1);
    EXPECT_EQ(log.said(), (Lines{"ERR 8c7cff000001 - libGetEthPortByEthMac got User exception 7: busy",
                                 "ERR 8c7cff000001 - libGetEthPortByEthMac got std exception: broken",
                                 "ERR libGetEthPortByEthMac got default exception for 8c7cff000001"}));
    EXPECT_EQ(library.calls.size(), 3u);
}

TEST_F(Ethernet_Port_Query, AnAddressTooShortIsMinus1)
{
    EXPECT_EQ(query("8"), -1);
    EXPECT_EQ(query(""), -1);
    EXPECT_EQ(library.calls.size(), 0u);
    EXPECT_EQ(log.said(), (Lines{R"(ERR "8" is no address: it has fewer than two characters)",
                                 R"(ERR "" is no address: it has fewer than two characters)"}))
        << "a call that was not made is not told of";
}

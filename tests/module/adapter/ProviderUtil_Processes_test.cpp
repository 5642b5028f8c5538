#include "module/adapter/ProviderUtil.h"

#include "tests/support/Named_Process.h"
#include "tests/support/Temp_Folder.h"

#include <gtest/gtest.h>

#include <csignal>

using namespace KPRV;

namespace {

int port_beside(const char* name)
{
    Named_Process process(name);
    return ProviderUtil::getAgentPort();
}

/// A tftp client and an rm of the test's own, which write down their arguments.
struct Tftp : testing::Test
{
    Temp_Folder folder;
    Environment_Override path{"PATH", folder.path() + ":/nowhere"};

    void program(const char* name, const char* rest)
    {
        const std::string log = folder.path("calls");
        folder.write(name,
                     std::string("#!/bin/sh\n{ printf '") + name + "'; printf ' [%s]' \"$@\"; echo; } >> " +
                         log + "\n" + rest + "\n",
                     true);
    }
};

} // namespace

TEST(ProviderUtil_Processes, TheAgentRunsWhileAProcessOfItsNameDoes)
{
    EXPECT_EQ(ProviderUtil::getAgentPort(), 0);
    EXPECT_EQ(port_beside("qxmagent"), 34568);
    EXPECT_EQ(ProviderUtil::getAgentPort(), 0);
}

TEST(ProviderUtil_Processes, TheEndOfTheNameCounts)
{
    EXPECT_EQ(port_beside("qxmagentd"), 0);
    EXPECT_EQ(port_beside("qxmagen"), 0);
    EXPECT_EQ(port_beside("QXMAGENT"), 0);
    EXPECT_EQ(port_beside(") S (qxmagent"), 34568);
    EXPECT_EQ(port_beside("qxmagent) R 1"), 0);
}

TEST(ProviderUtil_Processes, AZombieIsNoAgent)
{
    Named_Process process("qxmagent");
    process.end();
    EXPECT_EQ(ProviderUtil::getAgentPort(), 0);
}

TEST_F(Tftp, RemovesTheFileAndFetchesIt)
{
    program("rm", "exit 1");
    program("tftp", "exit 0");
    EXPECT_EQ(ProviderUtil::TftpGetFile("10.1.2.3", "fw.bin"), 0);
    EXPECT_EQ(folder.read("calls"), "rm [-f] [fw.bin]\ntftp [10.1.2.3] [-c] [get] [fw.bin]\n");
}

TEST_F(Tftp, HostileNamesFindNoShell)
{
    program("rm", "exit 0");
    program("tftp", "exit 0");
    EXPECT_EQ(ProviderUtil::TftpGetFile("h; touch x", "$(id) `id` a b"), 0);
    EXPECT_EQ(folder.read("calls"),
              "rm [-f] [$(id) `id` a b]\ntftp [h; touch x] [-c] [get] [$(id) `id` a b]\n");
}

TEST_F(Tftp, TheResultIsTheClientSWaitStatus)
{
    program("rm", "exit 0");
    program("tftp", "exit 3");
    EXPECT_EQ(ProviderUtil::TftpGetFile("h", "f"), 3 << 8);
    program("tftp", "kill -9 $$");
    EXPECT_EQ(ProviderUtil::TftpGetFile("h", "f"), SIGKILL);
}

TEST_F(Tftp, WithoutAClientTheResultIsAShellS)
{
    program("rm", "exit 0");
    EXPECT_EQ(ProviderUtil::TftpGetFile("h", "f"), 127 << 8);
    folder.write("tftp", "not executable");
    EXPECT_EQ(ProviderUtil::TftpGetFile("h", "f"), 126 << 8);
}

TEST_F(Tftp, WhetherAFileExists)
{
    folder.write("there", "");
    EXPECT_TRUE(ProviderUtil::IsFileExist(folder.path("there").c_str()));
    EXPECT_TRUE(ProviderUtil::IsFileExist(folder.path().c_str()));
    EXPECT_FALSE(ProviderUtil::IsFileExist(folder.path("not_there").c_str()));
    EXPECT_FALSE(ProviderUtil::IsFileExist(""));
}

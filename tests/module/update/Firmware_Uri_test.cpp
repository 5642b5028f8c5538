#include "module/update/Firmware_Uri.h"

#include "module/update/Install_Failure.h"
#include "tests/support/Log_Capture.h"
#include "tests/support/Scripted_Programs.h"

#include <gtest/gtest.h>

#include <optional>

using namespace KPRV;

namespace {

struct Firmware_Uri : testing::Test
{
    Scripted_Programs programs;
    Log_Capture log;

    void SetUp() override
    {
        programs.program("rm");
        programs.program("tftp");
    }
    /// The words of a refusal; nothing where the file is fetched.
    std::optional<std::string> refused(const char* uri)
    {
        log.clear();
        try {
            fetch_firmware(uri);
            return {};
        } catch (const Install_Failure& failure) {
            return failure.text;
        }
    }
};

} // namespace

TEST_F(Firmware_Uri, AFileOfThisHost)
{
    EXPECT_STREQ("/var/fw/a b.bin", fetch_firmware("file:///var/fw/a b.bin").c_str());
    EXPECT_STREQ("fw.bin", fetch_firmware("file://fw.bin").c_str());
    EXPECT_STREQ("tftp://h/f", fetch_firmware("file://tftp://h/f").c_str());
    EXPECT_EQ((Lines{"INFO file=/var/fw/a b.bin", "INFO file=fw.bin", "INFO file=tftp://h/f"}), log.said());
    EXPECT_TRUE(programs.runs().empty());
}

TEST_F(Firmware_Uri, AFileWithoutAName)
{
    EXPECT_EQ("malformed file URI", refused("file://"));
    EXPECT_EQ(Lines{"INFO file="}, log.said());
}

TEST_F(Firmware_Uri, AFetchedFileIsRemovedFirstAndHasItsRemoteName)
{
    EXPECT_STREQ("fw.bin", fetch_firmware("tftp://10.1.2.3/fw.bin").c_str());
    EXPECT_STREQ("dir/fw.bin", fetch_firmware("tftp://ab/dir/fw.bin").c_str());
    EXPECT_STREQ("/abs", fetch_firmware("tftp://ab//abs").c_str());
    EXPECT_EQ((Lines{"rm [-f] [fw.bin]", "tftp [10.1.2.3] [-c] [get] [fw.bin]", "rm [-f] [dir/fw.bin]",
                     "tftp [ab] [-c] [get] [dir/fw.bin]", "rm [-f] [/abs]", "tftp [ab] [-c] [get] [/abs]"}),
              programs.runs());
    EXPECT_TRUE(log.said().empty());
}

TEST_F(Firmware_Uri, AHostHasTwoCharactersAndAFileOne)
{
    for (const char* uri : {"tftp://", "tftp:///", "tftp:///f", "tftp://h/f", "tftp://h", "tftp://host",
                            "tftp://host/", "tftp://h/", "tftp://h/a/b"}) {
        EXPECT_EQ("malformed tftp URI", refused(uri)) << uri;
        EXPECT_TRUE(log.said().empty());
    }
    EXPECT_TRUE(programs.runs().empty());
    EXPECT_EQ(std::nullopt, refused("tftp://hh/f"));
}

TEST_F(Firmware_Uri, NoOtherSchemeAndNoCapitals)
{
    for (const char* uri : {"FILE:///f", "TFTP://host/f", "File:///f", "http://host/f", "file:/f", "/f", "f",
                            "", "file:/", "tftp:/", " file:///f", "file"}) {
        EXPECT_EQ("malformed URI", refused(uri)) << uri;
        EXPECT_EQ(Lines{"ERR malformed uri. Throw error"}, log.said());
    }
    EXPECT_TRUE(programs.runs().empty());
}

TEST_F(Firmware_Uri, WhatTheRemoverSaysDoesNotMatter)
{
    programs.program("rm", "exit 1");
    EXPECT_EQ(std::nullopt, refused("tftp://host/f"));
}

TEST_F(Firmware_Uri, AnyStatusOfTheClientBut0IsAFailure)
{
    for (const char* end : {"exit 1", "exit 69", "exit 127", "kill -9 $$"}) {
        programs.program("tftp", end);
        EXPECT_EQ("tftp command failed", refused("tftp://host/f")) << end;
    }
}

TEST_F(Firmware_Uri, HostileNamesStaySingleWords)
{
    EXPECT_EQ(std::nullopt, refused("tftp://a;touch b`id`/$(touch c) | d > e"));
    EXPECT_EQ((Lines{"rm [-f] [$(touch c) | d > e]", "tftp [a;touch b`id`] [-c] [get] [$(touch c) | d > e]"}),
              programs.runs());
}

TEST(Firmware_Uri_Without_Client, CannotBeFetched)
{
    Scripted_Programs none;
    EXPECT_THROW(fetch_firmware("tftp://host/f"), Install_Failure);
}

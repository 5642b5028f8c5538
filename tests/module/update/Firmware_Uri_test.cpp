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

TEST_F(Firmware_Uri, a_file_of_this_host)
{
    EXPECT_STREQ("/var/fw/a b.bin", fetch_firmware("file:///var/fw/a b.bin").c_str());
    EXPECT_STREQ("fw.bin", fetch_firmware("file://fw.bin").c_str());
    EXPECT_STREQ("tftp://h/f", fetch_firmware("file://tftp://h/f").c_str());
    EXPECT_EQ((Lines{"INFO file=/var/fw/a b.bin", "INFO file=fw.bin", "INFO file=tftp://h/f"}), log.said());
    EXPECT_TRUE(programs.runs().empty());
}

TEST_F(Firmware_Uri, a_file_without_a_name)
{
    EXPECT_EQ("malformed file URI", refused("file://"));
    EXPECT_EQ(Lines{"INFO file="}, log.said());
}

TEST_F(Firmware_Uri, a_fetched_file_is_removed_first_and_has_its_remote_name)
{
    EXPECT_STREQ("fw.bin", fetch_firmware("tftp://10.1.2.3/fw.bin").c_str());
    EXPECT_STREQ("dir/fw.bin", fetch_firmware("tftp://ab/dir/fw.bin").c_str());
    EXPECT_STREQ("/abs", fetch_firmware("tftp://ab//abs").c_str());
    EXPECT_EQ((Lines{"rm [-f] [fw.bin]", "tftp [10.1.2.3] [-c] [get] [fw.bin]", "rm [-f] [dir/fw.bin]",
                     "tftp [ab] [-c] [get] [dir/fw.bin]", "rm [-f] [/abs]", "tftp [ab] [-c] [get] [/abs]"}),
              programs.runs());
    EXPECT_TRUE(log.said().empty());
}

TEST_F(Firmware_Uri, a_host_has_two_characters_and_a_file_one)
{
    for (const char* uri : {"tftp://", "tftp:///", "tftp:///f", "tftp://h/f", "tftp://h", "tftp://host",
                            "tftp://host/", "tftp://h/", "tftp://h/a/b"}) {
        EXPECT_EQ("malformed tftp URI", refused(uri)) << uri;
        EXPECT_TRUE(log.said().empty());
    }
    EXPECT_TRUE(programs.runs().empty());
    EXPECT_EQ(std::nullopt, refused("tftp://hh/f"));
}

TEST_F(Firmware_Uri, no_other_scheme_and_no_capitals)
{
    for (const char* uri : {"FILE:///f", "TFTP://host/f", "File:///f", "http://host/f", "file:/f", "/f", "f",
                            "", "file:/", "tftp:/", " file:///f", "file"}) {
        EXPECT_EQ("malformed URI", refused(uri)) << uri;
        EXPECT_EQ(Lines{"ERR malformed uri. Throw error"}, log.said());
    }
    EXPECT_TRUE(programs.runs().empty());
}

TEST_F(Firmware_Uri, what_the_remover_says_does_not_matter)
{
    programs.program("rm", "exit 1");
    EXPECT_EQ(std::nullopt, refused("tftp://host/f"));
}

TEST_F(Firmware_Uri, any_status_of_the_client_but_0_is_a_failure)
{
    for (const char* end : {"exit 1", "exit 69", "exit 127", "kill -9 $$"}) {
        programs.program("tftp", end);
        EXPECT_EQ("tftp command failed", refused("tftp://host/f")) << end;
    }
}

TEST_F(Firmware_Uri, hostile_names_stay_single_words)
{
    EXPECT_EQ(std::nullopt, refused("tftp://a;touch b`id`/$(touch c) | d > e"));
    EXPECT_EQ((Lines{"rm [-f] [$(touch c) | d > e]", "tftp [a;touch b`id`] [-c] [get] [$(touch c) | d > e]"}),
              programs.runs());
}

TEST(Firmware_Uri_Without_Client, cannot_be_fetched)
{
    Scripted_Programs none;
    EXPECT_THROW(fetch_firmware("tftp://host/f"), Install_Failure);
}

// The verb that waits for indications, as users run it.
#include "tests/kldrcim/Run_Kldrcim.h"

#include <algorithm>
#include <csignal>
#include <fcntl.h>
#include <gtest/gtest.h>
#include <json/json.h>
#include <unistd.h>

namespace KPRV::kldrcim {
namespace {

const char* const block = "root/toy:TOY_Alert\n  Text = smoke\n\n";

TEST(Cli_Watch, EndsAfterTheCount)
{
    const Outcome run = kldrcim("watch TOY_Alert --count 1");
    EXPECT_EQ(0, run.status);
    EXPECT_EQ(block, run.out);
    EXPECT_EQ("", run.error);
}

TEST(Cli_Watch, WritesTheFormatsOfTheOtherVerbs)
{
    Json::Value parsed;
    const Outcome json = kldrcim("watch TOY_Alert --count 1 --format json");
    ASSERT_TRUE(Json::Reader().parse(json.out, parsed)) << json.out;
    EXPECT_EQ("smoke", parsed["properties"]["Text"].asString());
    EXPECT_EQ("root/toy:TOY_Alert", parsed["path"].asString());
    const Outcome mof = kldrcim("watch TOY_Alert --count 1 --format mof");
    EXPECT_EQ(0u, mof.out.find("instance of TOY_Alert {\n    Text = \"smoke\";\n")) << mof.out;
    EXPECT_EQ("{\"class\": \"TOY_Alert\", \"path\": \"root/toy:TOY_Alert\", \"properties\": {\"Text\": "
              "\"smoke\"}}\n",
              kldrcim("watch TOY_Alert --count 1 --format jsonl").out);
    const Outcome none = kldrcim("watch TOY_Alert --count 1 --properties Other");
    EXPECT_EQ("root/toy:TOY_Alert\n\n", none.out);
}

TEST(Cli_Watch, WritesWhatMeetsTheConditions)
{
    EXPECT_EQ(block, kldrcim("watch TOY_Alert --count 1 --where Text=smoke").out);
    EXPECT_EQ(block, kldrcim("watch TOY_Alert --count 1 --where Text~SM* --where Other=").out);
    // What is looked at need not be shown.
    EXPECT_EQ("root/toy:TOY_Alert\n\n",
              kldrcim("watch TOY_Alert --count 1 --where Text=smoke --properties Other").out);
}

TEST(Cli_Watch, TakesFiltersInSeveralNamespaces)
{
    EXPECT_EQ(block, kldrcim("watch TOY_Alert --count 1 --filter root/toy --filter root/other").out);
}

TEST(Cli_Watch, SaysWhoRefuses)
{
    for (const char* arguments : {"watch TOY_Silent", "watch TOY_Item", "watch"}) {
        const Outcome run = kldrcim(arguments);
        EXPECT_EQ(1, run.status) << arguments;
        EXPECT_NE(std::string::npos, run.error.find("takes no subscription for root/toy\n")) << run.error;
        EXPECT_EQ("", run.out);
    }
}

TEST(Cli_Watch, KnowsItsOptions)
{
    for (const char* count : {"0", "-1", "x", "1x", "\"\"", "99999999999"}) {
        const Outcome run = kldrcim(std::string("watch --count ") + count);
        EXPECT_EQ(2, run.status) << count;
        EXPECT_EQ(0u, run.error.find("kldrcim: --count takes a number above 0, not \"")) << run.error;
    }
    EXPECT_EQ("kldrcim: --filter takes a namespace, not \"\"\n", kldrcim("watch --filter ''").error);
    EXPECT_EQ("kldrcim: --count wants a value\n", kldrcim("watch --count").error);
    EXPECT_EQ("kldrcim: --sort makes no sense for watch; it is for ei ein ai ain ri rin luns diag classes\n",
              kldrcim("watch --sort Text").error);
    EXPECT_EQ("kldrcim: usage: kldrcim [options] watch [CLASS]\n", kldrcim("watch A B").error);
}

/// A watch that runs, and the reading end of its output.
struct Running_Watch
{
    explicit Running_Watch(bool is_read = true)
    {
        int ends[2];
        if (pipe2(ends, O_CLOEXEC) != 0)
            std::abort();
        out = ends[0];
        if (!is_read)
            close(out);
        child = fork();
        if (child == 0) {
            dup2(ends[1], STDOUT_FILENO);
            execl(KLDRCIM, "kldrcim", "--module", TOY_DESCRIBED, "--namespace", "root/toy", "watch",
                  "TOY_Alert", static_cast<char*>(nullptr));
            _exit(127);
        }
        close(ends[1]);
    }
    /// What it writes up to the end of the first block.
    std::string first_block() const
    {
        std::string text;
        char buffer[256];
        for (ssize_t count = 1; count > 0 && text.find("\n\n") == std::string::npos;) {
            count = read(out, buffer, sizeof buffer);
            text.append(buffer, static_cast<std::size_t>(std::max<ssize_t>(count, 0)));
        }
        return text;
    }
    /// Waits for its end; -1 if that is no exit.
    int status() const
    {
        int status = 0;
        waitpid(child, &status, 0);
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }

    int out;
    pid_t child;
};

TEST(Cli_Watch, UnsubscribesWhenItIsInterrupted)
{
    for (const int signal : {SIGINT, SIGTERM}) {
        const Running_Watch watch;
        EXPECT_EQ(block, watch.first_block());
        kill(watch.child, signal);
        EXPECT_EQ(0, watch.status());
        close(watch.out);
    }
}

TEST(Cli_Watch, EndsWhenNobodyReads)
{
    EXPECT_EQ(0, Running_Watch(false).status());
}

TEST(Cli_Watch, SaysWhatTheOutputLacks)
{
    const std::string watch =
        std::string(KLDRCIM) + " --module " + TOY_DESCRIBED + " --namespace root/toy watch TOY_Alert";
    const int full = std::system((watch + " >/dev/full 2>cli_watch.err").c_str());
    EXPECT_EQ(1, WEXITSTATUS(full));
    EXPECT_EQ("kldrcim: write error: No space left on device\n", read_file("cli_watch.err"));
}

} // namespace
} // namespace KPRV::kldrcim

// Many results: they are written as they come, and none is kept.
#include "tests/kldrcim/Run_Kldrcim.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <json/json.h>
#include <poll.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

namespace KPRV::kldrcim {
namespace {

constexpr const char* formats[] = {"table", "json", "jsonl", "mof"};

std::string many(unsigned count)
{
    return "TOY_MANY=" + std::to_string(count);
}

/// kldrcim with its standard output on a pipe.
class Piped
{
public:
    explicit Piped(const std::vector<std::string>& arguments)
    {
        int ends[2];
        EXPECT_EQ(0, pipe(ends));
        _pid = fork();
        if (_pid == 0) {
            dup2(ends[1], STDOUT_FILENO);
            close(ends[0]);
            close(ends[1]);
            std::vector<char*> words;
            for (const std::string& argument : arguments)
                words.push_back(const_cast<char*>(argument.c_str()));
            words.push_back(nullptr);
            execv(words[0], words.data());
            _exit(127);
        }
        close(ends[1]);
        _output = ends[0];
    }
    ~Piped()
    {
        close(_output);
        rusage usage;
        wait4(_pid, nullptr, 0, &usage);
    }

    /// What comes next; empty at the end, or if nothing comes for a long time.
    std::string read_some()
    {
        pollfd ready = {_output, POLLIN, 0};
        char buffer[65536];
        const ssize_t size = poll(&ready, 1, 60000) == 1 ? read(_output, buffer, sizeof buffer) : 0;
        return {buffer, static_cast<std::size_t>(std::max<ssize_t>(size, 0))};
    }
    /// Reads to the end; its memory at its most, in kilobytes.
    long most_memory()
    {
        while (!read_some().empty())
            continue;
        rusage usage = {};
        wait4(_pid, nullptr, 0, &usage);
        return usage.ru_maxrss;
    }

private:
    pid_t _pid;
    int _output;
};

std::vector<std::string> command(const char* verb, const char* format)
{
    return {KLDRCIM,    "--module", TOY_DESCRIBED, "--namespace", "root/toy",
            "--format", format,     verb,          "TOY_Many"};
}

TEST(Streamed_Results, TheFirstIsReadBeforeTheLastIsThere)
{
    const char* const fifo = "streamed.fifo";
    unlink(fifo);
    ASSERT_EQ(0, mkfifo(fifo, 0600));
    setenv("TOY_MANY", "20000", 1);
    setenv("TOY_MANY_WAITS", fifo, 1);
    for (const char* verb : {"ei", "ein"})
        for (const char* format : formats) {
            SCOPED_TRACE(std::string(verb) + " " + format);
            Piped run(command(verb, format));
            std::string text = run.read_some();
            EXPECT_NE(std::string::npos, text.find('1')) << "the provider waits until somebody has read";
            const int writer = open(fifo, O_RDWR);
            for (std::string more = text; !more.empty(); text += more)
                more = run.read_some();
            close(writer);
            EXPECT_NE(std::string::npos, text.find("20000"));
        }
    unsetenv("TOY_MANY");
    unsetenv("TOY_MANY_WAITS");
    unlink(fifo);
}

TEST(Streamed_Results, TheFirstIsReadBeforeTheSecondIsThere)
{
    const char* const fifo = "streamed.fifo";
    unlink(fifo);
    ASSERT_EQ(0, mkfifo(fifo, 0600));
    setenv("TOY_MANY", "2", 1);
    setenv("TOY_MANY_WAITS", fifo, 1);
    for (const char* verb : {"ei", "ein"})
        for (const char* format : formats) {
            const bool has_widths = verb == std::string("ei") && format == std::string("table");
            if (has_widths)
                continue;
            SCOPED_TRACE(std::string(verb) + " " + format);
            Piped run(command(verb, format));
            std::string text;
            while (text.find('1') == text.npos)
                text += run.read_some();
            EXPECT_EQ(std::string::npos, text.find('2')) << "the provider waits until somebody has read";
            const int writer = open(fifo, O_RDWR);
            for (std::string more = text; !more.empty(); text += more)
                more = run.read_some();
            close(writer);
            EXPECT_NE(std::string::npos, text.find('2'));
        }
    unsetenv("TOY_MANY");
    unsetenv("TOY_MANY_WAITS");
    unlink(fifo);
}

#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
TEST(Streamed_Results, TheirNumberTakesNoMemory)
{
    // Of a provider that releases what it made, and of one that leaves it all to the server.
    for (const bool leaves : {false, true})
        for (const char* verb : {"ei", "ein"})
            for (const char* format : formats) {
                SCOPED_TRACE(std::string(verb) + " " + format + (leaves ? " left" : ""));
                if (leaves)
                    setenv("TOY_MANY_LEAVES", "1", 1);
                setenv("TOY_MANY", "20000", 1);
                const long few = Piped(command(verb, format)).most_memory();
                setenv("TOY_MANY", "100000", 1);
                const long five_times = Piped(command(verb, format)).most_memory();
                // What is left fills some megabytes before it goes into a file.
                EXPECT_LT(five_times, few + (leaves ? 5000 : 2000)) << few << " kB for a fifth";
                EXPECT_LT(five_times, 40000);
            }
    unsetenv("TOY_MANY");
    unsetenv("TOY_MANY_LEAVES");
}
#endif

TEST(Streamed_Results, AJsonTextIsWholeWhateverTheirNumber)
{
    for (const unsigned count : {0u, 1u, 1500u}) {
        const Outcome run = kldrcim("ei TOY_Many --format json", TOY_DESCRIBED, many(count).c_str());
        Json::Value parsed;
        ASSERT_TRUE(Json::Reader().parse(run.out, parsed)) << run.out;
        EXPECT_EQ(count, parsed.size());
    }
    EXPECT_EQ("[]\n", kldrcim("ein TOY_Many --format json").out);
}

TEST(Streamed_Results, WhatCameBeforeAFailureIsWritten)
{
    const Outcome run = kldrcim("ein TOY_Many --format json", TOY_DESCRIBED, "TOY_MANY=1 TOY_MANY_FAILS=1");
    EXPECT_EQ(1, run.status);
    EXPECT_EQ("[\n  \"root/toy:TOY_Many.Id=1\"\n]\n", run.out);
    EXPECT_EQ("kldrcim: CIM_ERR_FAILED (1): no more of them\n", run.error);
    EXPECT_EQ("Id  Text\n--  ------\n1   as all\n",
              kldrcim("ei TOY_Many", TOY_DESCRIBED, "TOY_MANY=1 TOY_MANY_FAILS=1").out);
    // Of an answer that failed at once there is nothing to write.
    EXPECT_EQ("", kldrcim("ein TOY_Many --format json", TOY_DESCRIBED, "TOY_MANY_FAILS=1").out);
}

TEST(Streamed_Results, ATableIsSizedByItsFirstRows)
{
    const std::string text = kldrcim("ei TOY_Many", TOY_DESCRIBED, many(2001).c_str()).out;
    EXPECT_EQ(0u, text.find("Id    Text\n----  ------\n1     as all\n")) << text.substr(0, 60);
    EXPECT_NE(std::string::npos, text.find("\n2000  wider than all before\n2001  as all\n"));
}

TEST(Streamed_Results, APropertyWithoutAColumnBeginsANewTable)
{
    const std::string text = kldrcim("ei TOY_Many", TOY_DESCRIBED, many(3001).c_str()).out;
    EXPECT_NE(std::string::npos, text.find("\n2999  as all\n\nId    Text    Late\n----  ------  ----\n"
                                           "3000  as all  now\n3001  as all  now\n"))
        << text.substr(text.size() - 200);
    // Not where the columns were chosen.
    EXPECT_EQ(
        std::string::npos,
        kldrcim("ei TOY_Many --properties Id,Text", TOY_DESCRIBED, many(3001).c_str()).out.find("\n\n"));
}

} // namespace
} // namespace KPRV::kldrcim

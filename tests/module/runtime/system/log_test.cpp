#include "module/runtime/system/log.h"
#include "tests/support/In_Child.h"
#include "tests/support/Log_Capture.h"

#include <atomic>
#include <filesystem>
#include <gtest/gtest.h>
#include <pthread.h>
#include <sys/resource.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

using namespace KPRV;
namespace fs = std::filesystem;

namespace {

/// A home directory, at first without any file.
struct Home : Temp_Folder
{
    Home() : _override("HOME", path()) { close_log(); }
    ~Home() { close_log(); }

    void level(const char* name) const { write(".cimplerc", std::string("LOG_LEVEL=") + name + "\n"); }
    std::string messages() const { return read(".cimple/messages"); }

private:
    Environment_Override _override;
};

std::vector<std::string> split(const std::string& text)
{
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);)
        lines.push_back(line);
    return lines;
}

/// Number of open descriptors.
size_t open_files()
{
    return size_t(std::distance(fs::directory_iterator("/proc/self/fd"), fs::directory_iterator()));
}

/// The text behind the head of a line.
std::string text_of_line(const std::string& line)
{
    return line.substr(line.find("): ") + 3);
}

} // namespace

TEST(log, ALineIsTimeLevelPlaceAndText)
{
    Home home;
    home.level("DBG");
    log(Log_Level::WARN, "File.cpp", 12, "%s is %d", "answer", 42);
    const testing::Matcher<const std::string&> line =
        testing::MatchesRegex("[0-9]{4}/[0-9]{2}/[0-9]{2} [0-9]{2}:[0-9]{2}:[0-9]{2} "
                              "WARN: File\\.cpp\\(12\\): answer is 42\n");
    EXPECT_TRUE(line.Matches(home.messages())) << home.messages();
}

TEST(log, LevelsUpToTheConfiguredOneAreWritten)
{
    const char* const names[] = {"FATAL", "ERR", "WARN", "INFO", "DBG"};
    for (int configured = 0; configured < 5; configured++) {
        Home home;
        home.level(names[configured]);
        for (int level = 0; level < 5; level++)
            log(Log_Level(level), "F", 1, "x");
        const std::vector<std::string> lines = split(home.messages());
        ASSERT_EQ(lines.size(), size_t(configured + 1));
        for (size_t level = 0; level < lines.size(); level++)
            EXPECT_NE(lines[level].find(std::string(" ") + names[level] + ": F(1): x"), std::string::npos);
    }
}

TEST(log, EveryLineEndsInExactlyOneNewline)
{
    Home home;
    home.level("DBG");
    log(Log_Level::ERR, "F", 1, "without");
    log(Log_Level::ERR, "F", 1, "with\n");
    log(Log_Level::ERR, "F", 1, "two\n\n");
    log(Log_Level::ERR, "F", 1, "%s", "");
    const std::string all = home.messages();
    std::vector<std::string> texts;
    for (const std::string& line : split(all))
        texts.push_back(line.empty() ? "-" : text_of_line(line));
    EXPECT_EQ(texts, (std::vector<std::string>{"without", "with", "two", "-", ""}));
    EXPECT_EQ(all.back(), '\n');
}

TEST(log, LongTextsAreNotCut)
{
    Home home;
    home.level("DBG");
    const std::string text(20000, 'y');
    log(Log_Level::ERR, "F", 1, "%s", text.c_str());
    EXPECT_EQ(text_of_line(split(home.messages())[0]), text);
}

TEST(log, NothingHappensWithoutHome)
{
    Home home;
    home.level("DBG");
    unsetenv("HOME");
    log(Log_Level::ERR, "F", 1, "x");
    EXPECT_FALSE(fs::exists(home.path(".cimple")));
}

TEST(log, ArgumentsOfALineThatIsNotUsedAreNotMade)
{
    const Home home;
    home.level("ERR");
    int made = 0;
    LOG(ERR, "%d", ++made);
    LOG(DBG, "%d", ++made);
    EXPECT_EQ(1, made);
    // Each line may be the one that opens the log.
    close_log();
    LOG(DBG, "%d", ++made);
    LOG(DBG, "%d", ++made);
    EXPECT_EQ(2, made);
    EXPECT_EQ(1u, split(home.messages()).size());
}

TEST(log, ConfigurationIsTriedByEveryCall)
{
    Home home;
    const size_t before = open_files();
    log(Log_Level::ERR, "F", 1, "no file yet");
    home.level("LOUD");
    log(Log_Level::ERR, "F", 1, "no level yet");
    EXPECT_FALSE(fs::exists(home.path(".cimple")));
    EXPECT_EQ(open_files(), before);

    home.level("ERR");
    log(Log_Level::ERR, "F", 1, "now");
    log(Log_Level::WARN, "F", 1, "not this");
    log(Log_Level::ERR, "F", 1, "and on");
    const std::vector<std::string> lines = split(home.messages());
    ASSERT_EQ(lines.size(), 2u);
    EXPECT_EQ(text_of_line(lines[0]), "now");
    EXPECT_EQ(text_of_line(lines[1]), "and on");
}

TEST(log, AFileThatHasJustComeIsFoundAtOnce)
{
    for (int turn = 0; turn < 200; turn++) {
        Home home;
        home.write("prepared", "LOG_LEVEL=ERR\n");
        const std::string from = home.path("prepared"), to = home.path(".cimplerc");
        LOG(ERR, "nobody listens");
        // The quickest way to put one in place.
        ASSERT_EQ(rename(from.c_str(), to.c_str()), 0);
        LOG(ERR, "found");
        EXPECT_EQ(split(home.messages()).size(), 1u) << turn;
    }
}

TEST(log, AnotherHomeIsLookedAtAtOnce)
{
    Home other;
    other.level("ERR");
    for (int turn = 0; turn < 200; turn++) {
        Home home;
        LOG(ERR, "nobody listens");
        const Environment_Override override("HOME", other.path());
        LOG(ERR, "found");
        close_log();
        EXPECT_EQ(split(other.messages()).size(), size_t(turn) + 1);
    }
}

TEST(log, OnceOpenTheFileIsNotReadAgain)
{
    Home home;
    home.level("ERR");
    log(Log_Level::ERR, "F", 1, "one");
    home.level("DBG");
    log(Log_Level::DBG, "F", 1, "still above the level");
    EXPECT_EQ(split(home.messages()).size(), 1u);

    close_log();
    log(Log_Level::DBG, "F", 1, "two");
    EXPECT_EQ(split(home.messages()).size(), 2u);
}

TEST(log, CloseGivesTheDescriptorsBack)
{
    Home home;
    home.level("ERR");
    const size_t before = open_files();
    log(Log_Level::ERR, "F", 1, "one");
    EXPECT_EQ(open_files(), before + 2);
    close_log();
    close_log();
    EXPECT_EQ(open_files(), before);
}

TEST(log, FolderAndFilesHaveTheirModes)
{
    Home home;
    home.level("ERR");
    const mode_t mask = umask(027);
    log(Log_Level::ERR, "F", 1, "x");
    umask(mask);
    const auto mode = [&](const char* name) {
        struct stat info = {};
        stat(home.path(name).c_str(), &info);
        return info.st_mode & 07777;
    };
    EXPECT_EQ(mode(".cimple"), 0750u);
    EXPECT_EQ(mode(".cimple/messages"), 0640u);
    EXPECT_EQ(mode(".cimple/messages.lock"), 0600u);
}

TEST(log, AnExistingFolderAndLogAreUsed)
{
    Home home;
    fs::create_directory(home.path(".cimple"));
    home.write(".cimple/messages", "old\n");
    home.level("ERR");
    log(Log_Level::ERR, "F", 1, "new");
    const std::vector<std::string> lines = split(home.messages());
    ASSERT_EQ(lines.size(), 2u);
    EXPECT_EQ(lines[0], "old");
}

TEST(log, AFolderThatCannotBeUsedIsTriedAgain)
{
    Home home;
    home.level("ERR");
    home.write(".cimple", "a file in its place");
    const size_t before = open_files();
    log(Log_Level::ERR, "F", 1, "lost");
    fs::remove(home.path(".cimple"));

    // The lock can be opened, the log cannot.
    fs::create_directories(home.path(".cimple/messages"));
    log(Log_Level::ERR, "F", 1, "lost too");
    EXPECT_EQ(open_files(), before);
    fs::remove(home.path(".cimple/messages"));

    log(Log_Level::ERR, "F", 1, "kept");
    ASSERT_EQ(split(home.messages()).size(), 1u);
}

/// Puts what opening may wait for, or what is not there to be written to, in the place of a file.
struct Odd_File
{
    const char* name;
    void (*make)(const std::string& path);
};

const Odd_File odd_files[] = {
    {"a FIFO", [](const std::string& path) { ASSERT_EQ(mkfifo(path.c_str(), 0600), 0); }},
    {"a device", [](const std::string& path) { fs::create_symlink("/dev/zero", path); }},
    {"a FIFO behind a link",
     [](const std::string& path) {
         ASSERT_EQ(mkfifo((path + ".fifo").c_str(), 0600), 0);
         fs::create_symlink(path + ".fifo", path);
     }},
    {"a socket",
     [](const std::string& path) {
         const int descriptor = socket(AF_UNIX, SOCK_STREAM, 0);
         sockaddr_un address = {AF_UNIX, {}};
         path.copy(address.sun_path, sizeof address.sun_path - 1);
         ASSERT_EQ(bind(descriptor, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
         close(descriptor);
     }},
};

TEST(log, WhatIsNoRegularFileNeitherWaitsNorLogs)
{
    for (const Odd_File& odd : odd_files)
        for (const char* place : {".cimplerc", ".cimple/messages", ".cimple/messages.lock"}) {
            SCOPED_TRACE(std::string(odd.name) + " for " + place);
            in_child([&] {
                alarm(60); // whoever waits does so for ever
                Home home;
                home.level("ERR");
                fs::create_directory(home.path(".cimple"));
                fs::remove(home.path(place));
                odd.make(home.path(place));
                const size_t before = open_files();
                log(Log_Level::ERR, "F", 1, "lost");
                EXPECT_EQ(open_files(), before);
                fs::remove(home.path(place));
                home.level("ERR");
                log(Log_Level::ERR, "F", 1, "kept");
                EXPECT_EQ(split(home.messages()).size(), 1u);
            });
        }
}

TEST(log, LinksToRegularFilesAreFollowed)
{
    Home home;
    Temp_Folder elsewhere;
    elsewhere.write("rc", "LOG_LEVEL=ERR\n");
    elsewhere.write("log", "");
    elsewhere.write("lock", "");
    fs::create_directory(home.path(".cimple"));
    fs::create_symlink(elsewhere.path("rc"), home.path(".cimplerc"));
    fs::create_symlink(elsewhere.path("log"), home.path(".cimple/messages"));
    fs::create_symlink(elsewhere.path("lock"), home.path(".cimple/messages.lock"));
    log(Log_Level::ERR, "F", 1, "x");
    EXPECT_EQ(split(elsewhere.read("log")).size(), 1u);
}

// Sanitizers take more room for themselves than they could be given, and end the process without memory.
#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
TEST(log, ALineWithoutMemoryIsCut)
{
    in_child([] {
        Home home;
        home.level("ERR");
        log(Log_Level::ERR, "F", 1, "whole");
        const std::string text(100u << 20, 'y');
        std::ifstream statm("/proc/self/statm");
        rlim_t pages = 0;
        statm >> pages;
        const rlim_t room = pages * rlim_t(sysconf(_SC_PAGESIZE)) + (50u << 20);
        const rlimit limit = {room, room};
        ASSERT_EQ(setrlimit(RLIMIT_AS, &limit), 0);
        log(Log_Level::ERR, "F", 1, "%s", text.c_str());
        log(Log_Level::ERR, "F", 1, "%s", "whole again");
        const std::vector<std::string> lines = split(home.messages());
        ASSERT_EQ(lines.size(), 3u);
        EXPECT_EQ(lines[1].size(), 510u);
        EXPECT_EQ(text_of_line(lines[1]).find_first_not_of('y'), std::string::npos);
        EXPECT_EQ(text_of_line(lines[2]), "whole again");
    });
}
#endif

// The sanitizer does not see the scopes that a cancelled thread leaves, and takes its stack for poisoned.
#ifndef __SANITIZE_ADDRESS__
TEST(log, IsNoPlaceToBeCancelledAt)
{
    Home home;
    home.level("DBG");
    struct Argument
    {
        std::atomic<bool> is_in = false;
        std::atomic<bool> is_cancelled = false;
    } argument;
    pthread_t thread;
    const auto body = [](void* data) -> void* {
        auto& told = *static_cast<Argument*>(data);
        told.is_in = true;
        while (!told.is_cancelled)
            continue;
        {
            // Writes as it leaves: an unwinding in there would end the process.
            LOG_SCOPE("cancelled");
        }
        log(Log_Level::ERR, "F", 1, "last words");
        pthread_testcancel();
        return data;
    };
    ASSERT_EQ(pthread_create(&thread, nullptr, body, &argument), 0);
    while (!argument.is_in)
        continue;
    ASSERT_EQ(pthread_cancel(thread), 0);
    argument.is_cancelled = true;
    void* result = nullptr;
    pthread_join(thread, &result);
    EXPECT_EQ(result, PTHREAD_CANCELED);
    EXPECT_EQ(split(home.messages()).size(), 3u);
    log(Log_Level::ERR, "F", 1, "the mutex is free");
    EXPECT_EQ(split(home.messages()).size(), 4u);
}
#endif

TEST(log, AFailingLockDoesNotStopTheLine)
{
    Home home;
    home.level("ERR");
    log(Log_Level::ERR, "F", 1, "one");
    const std::string lock = fs::canonical(home.path(".cimple/messages.lock"));
    for (const auto& entry : fs::directory_iterator("/proc/self/fd")) {
        std::error_code ignored;
        if (fs::read_symlink(entry.path(), ignored) == lock) {
            close(std::stoi(entry.path().filename()));
            break;
        }
    }
    log(Log_Level::ERR, "F", 1, "two");
    EXPECT_EQ(split(home.messages()).size(), 2u);
}

TEST(log, SetLevelIsInMemoryOnly)
{
    Home home;
    home.level("ERR");
    EXPECT_EQ(log_set_level("DBG"), 0);
    log(Log_Level::DBG, "F", 1, "overwritten by the file");
    EXPECT_EQ(home.messages(), "");
    EXPECT_EQ(log_set_level("dbg"), 0);
    log(Log_Level::DBG, "F", 1, "now");
    EXPECT_EQ(split(home.messages()).size(), 1u);
    EXPECT_EQ(log_set_level("LOUD"), -1);
    log(Log_Level::DBG, "F", 1, "still");
    EXPECT_EQ(split(home.messages()).size(), 2u);
}

TEST(log, LevelNamesAreFoundWhateverTheirCase)
{
    Log_Level level = Log_Level::FATAL;
    EXPECT_EQ(_validate_log_level("info", level), 0);
    EXPECT_EQ(level, Log_Level::INFO);
    EXPECT_EQ(_validate_log_level("DEBUG", level), -1);
    EXPECT_EQ(_validate_log_level("", level), -1);
    EXPECT_EQ(level, Log_Level::INFO);
}

TEST(log, EnableSwitchesTheConversionLinesOnly)
{
    Home home;
    home.level("DBG");
    EXPECT_EQ(log_enable(true), -1);
    EXPECT_EQ(log_enable(false), 0);
    EXPECT_EQ(log_enable(false), -1);
    LOG_CONVERSION(WARN, "silenced");
    LOG(WARN, "direct");
    EXPECT_EQ(log_enable(true), 0);
    LOG_CONVERSION(WARN, "%s", "heard");
    const std::vector<std::string> lines = split(home.messages());
    ASSERT_EQ(lines.size(), 2u);
    EXPECT_EQ(text_of_line(lines[0]), "direct");
    EXPECT_EQ(text_of_line(lines[1]), "heard");
    EXPECT_NE(lines[1].find(" WARN: log_test.cpp("), std::string::npos);
}

TEST(log, ScopeTracesItsEnds)
{
    Log_Capture capture;
    {
        LOG_SCOPE("enum_instances");
        LOG(ERR, "inside");
    }
    std::vector<std::string> texts;
    for (const Log_Capture::Line& line : capture.lines()) {
        EXPECT_EQ(line.file, "log_test.cpp");
        texts.push_back(line.level + " " + line.text);
    }
    EXPECT_EQ(texts, (std::vector<std::string>{"DBG Entering: enum_instances", "ERR inside",
                                               "DBG Returning: enum_instances"}));
}

/// Lines of 300 characters of one letter: a mixed or torn one would show.
static void write_lines(char letter, int count)
{
    const std::string text(300, letter);
    for (int i = 0; i < count; i++)
        log(Log_Level::ERR, "F", 1, "%s", text.c_str());
}

static void expect_whole_lines(const std::string& messages, size_t count)
{
    const std::vector<std::string> lines = split(messages);
    EXPECT_EQ(lines.size(), count);
    for (const std::string& line : lines) {
        const std::string text = text_of_line(line);
        EXPECT_EQ(text, std::string(300, text[0]));
    }
}

TEST(log, LinesOfThreadsStayWhole)
{
    Home home;
    home.level("DBG");
    std::vector<std::thread> threads;
    for (char letter = 'a'; letter < 'e'; letter++)
        threads.emplace_back(write_lines, letter, 100);
    for (std::thread& thread : threads)
        thread.join();
    expect_whole_lines(home.messages(), 400);
}

TEST(log, LinesOfProcessesStayWhole)
{
    Home home;
    home.level("DBG");
    std::vector<pid_t> children;
    for (char letter = 'a'; letter < 'd'; letter++) {
        const pid_t child = fork();
        if (child == 0) {
            write_lines(letter, 100);
            _exit(0);
        }
        children.push_back(child);
    }
    write_lines('z', 100);
    for (const pid_t child : children)
        waitpid(child, nullptr, 0);
    expect_whole_lines(home.messages(), 400);
}

#include "module/adapter/Child_Program.h"

#include "tests/support/In_Child.h"
#include "tests/support/Scripted_Programs.h"

#include <gtest/gtest.h>

#include <csignal>
#include <fcntl.h>
#include <sys/resource.h>
#include <sys/wait.h>

using namespace KPRV;

namespace {

/// In a process of its own, which plays the server.
struct Child_Program : testing::Test
{
    Scripted_Programs programs;
    Temp_Folder folder;

    static int run(std::initializer_list<const char*> words)
    {
        std::vector<const char*> arguments = words;
        arguments.push_back(nullptr);
        return run_program(arguments.data());
    }
    /// What the program writes into the file "seen".
    Lines seen() const
    {
        std::istringstream text(folder.read("seen"));
        Lines lines;
        for (std::string line; std::getline(text, line);)
            lines.push_back(line);
        return lines;
    }
    std::string into_seen(const std::string& command) const { return command + " > " + folder.path("seen"); }

    static void set_handler(int number, void (*handler)(int))
    {
        struct sigaction action = {};
        action.sa_handler = handler;
        sigaction(number, &action, nullptr);
    }
};

} // namespace

TEST_F(Child_Program, GetsItsWords)
{
    programs.program("program");
    EXPECT_EQ(run({"program", "a b", "", "$(c)"}), 0);
    EXPECT_EQ(programs.runs(), Lines{"program [a b] [] [$(c)]"});
}

TEST_F(Child_Program, TellsHowItEnded)
{
    programs.program("program", "exit 3");
    EXPECT_EQ(run({"program"}), 3 << 8);
    programs.program("program", "kill -9 $$");
    EXPECT_EQ(run({"program"}), SIGKILL);
}

TEST_F(Child_Program, ThatIsNotThereOrNoProgramEndsAsInAShell)
{
    EXPECT_EQ(run({"program"}), 127 << 8);
    Temp_Folder one, two;
    const Environment_Override path("PATH", one.path() + ":" + two.path());
    one.write("program", "not executable");
    EXPECT_EQ(run({"program"}), 126 << 8);
    two.write("program", "#!/bin/sh\nexit 5\n", true);
    EXPECT_EQ(run({"program"}), 5 << 8) << "a later folder may have one";
}

TEST_F(Child_Program, IsLookedForWhereTheSearchPathSays)
{
    Temp_Folder here;
    here.write("program", "#!/bin/sh\nexit 7\n", true);
    in_child([&] {
        ASSERT_EQ(chdir(here.path().c_str()), 0);
        for (const char* path : {"", ":/nowhere", "/nowhere:", "/nowhere::/nor/here"}) {
            setenv("PATH", path, 1);
            EXPECT_EQ(run({"program"}), 7 << 8) << path;
        }
        unsetenv("PATH");
        EXPECT_EQ(run({"true"}), 0);
        EXPECT_EQ(run({"program"}), 127 << 8);
    });
}

TEST_F(Child_Program, OfAServerThatIgnoresItsChildrenTellsHowItEnded)
{
    programs.program("good");
    programs.program("bad", "exit 9");
    in_child([] {
        set_handler(SIGCHLD, SIG_IGN);
        EXPECT_EQ(run({"good"}), 0);
        EXPECT_EQ(run({"bad"}), 9 << 8);
        struct sigaction now = {};
        sigaction(SIGCHLD, nullptr, &now);
        EXPECT_EQ(now.sa_handler, SIG_IGN) << "the server's own business";
    });
}

TEST_F(Child_Program, OfAServerThatWaitsForAllChildrenTellsHowItEnded)
{
    programs.program("good");
    programs.program("bad", "exit 9");
    in_child([] {
        set_handler(SIGCHLD, [](int) {
            const int error = errno;
            while (waitpid(-1, nullptr, WNOHANG) > 0)
                continue;
            errno = error;
        });
        for (int i = 0; i < 20; i++) {
            EXPECT_EQ(run({"good"}), 0);
            EXPECT_EQ(run({"bad"}), 9 << 8);
        }
    });
}

TEST_F(Child_Program, LeavesNoZombie)
{
    programs.program("program");
    in_child([] {
        run({"program"});
        EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1);
        EXPECT_EQ(errno, ECHILD);
    });
}

TEST_F(Child_Program, FindsSignalsAsAtTheStartOfAProcess)
{
    // The shell has no say in these two: it takes over what it finds.
    programs.program("program", into_seen(R"(while read name value; do
        case $name in SigBlk:|SigIgn:) echo $name $value;; esac
        done < /proc/self/status)"));
    in_child([] {
        sigset_t all;
        sigfillset(&all);
        sigprocmask(SIG_SETMASK, &all, nullptr);
        for (const int number : {SIGTERM, SIGHUP, SIGPIPE, SIGINT, SIGUSR1})
            set_handler(number, SIG_IGN);
        EXPECT_EQ(run({"program"}), 0);
        sigset_t now;
        sigprocmask(SIG_SETMASK, nullptr, &now);
        EXPECT_TRUE(sigismember(&now, SIGTERM)) << "the server's own business";
    });
    EXPECT_EQ(seen(), (Lines{"SigBlk: 0000000000000000", "SigIgn: 0000000000000000"}));
}

TEST_F(Child_Program, FindsNoDescriptorButStandardOnesAndNoInput)
{
    // The shell itself holds its script and the folder open, and nothing else.
    programs.program("program", into_seen(R"({
        for each in /proc/$$/fd/*; do
            case ${each##*/} in 0|1|2) echo ${each##*/}; continue;; esac
            case $(/usr/bin/readlink $each) in *input) echo leaked ${each##*/};; esac
        done
        read line || echo no input; })"));
    folder.write("input", "the server's input\n");
    in_child([&] {
        const int input = open(folder.path("input").c_str(), O_RDONLY);
        dup2(input, STDIN_FILENO);
        for (const int each : {20, 21, 100, 1000})
            dup2(input, each);
        EXPECT_EQ(run({"program"}), 0);
        EXPECT_EQ(fcntl(1000, F_GETFD), 0) << "the server keeps its own";
    });
    EXPECT_EQ(seen(), (Lines{"0", "1", "2", "no input"}));
}

TEST_F(Child_Program, WritesWhereTheServerWrites)
{
    programs.program("program", "echo output; echo errors >&2");
    in_child([&] {
        const int output = fcntl(STDOUT_FILENO, F_DUPFD, 50), errors = fcntl(STDERR_FILENO, F_DUPFD, 50);
        const int both = open(folder.path("seen").c_str(), O_WRONLY | O_CREAT | O_APPEND, 0600);
        dup2(both, STDOUT_FILENO);
        dup2(both, STDERR_FILENO);
        const int status = run({"program"});
        dup2(output, STDOUT_FILENO);
        dup2(errors, STDERR_FILENO);
        EXPECT_EQ(status, 0);
    });
    EXPECT_EQ(seen(), (Lines{"output", "errors"}));
}

TEST_F(Child_Program, OfAServerWithoutStandardDescriptorsHasThem)
{
    // What is asked must not be redirected itself.
    programs.program("program",
                     "echo lost; echo lost >&2; [ -e /proc/$$/fd/1 ] && [ -e /proc/$$/fd/2 ] && found=both; "
                     "echo $found > " +
                         folder.path("seen") + "; exit 4");
    in_child([] {
        // What expectations print has no place to go: the status tells.
        const int output = fcntl(STDOUT_FILENO, F_DUPFD, 50), errors = fcntl(STDERR_FILENO, F_DUPFD, 50);
        for (const int each : {0, 1, 2})
            close(each);
        const int status = run({"program"});
        const bool are_closed = fcntl(0, F_GETFD) < 0 && fcntl(1, F_GETFD) < 0 && fcntl(2, F_GETFD) < 0;
        dup2(output, STDOUT_FILENO);
        dup2(errors, STDERR_FILENO);
        EXPECT_EQ(status, 4 << 8);
        EXPECT_TRUE(are_closed);
    });
    EXPECT_EQ(seen(), Lines{"both"});
}

TEST_F(Child_Program, CannotBeRunWhereNoDescriptorIsFree)
{
    programs.program("program");
    in_child([] {
        rlimit limit = {};
        getrlimit(RLIMIT_NOFILE, &limit);
        limit.rlim_cur = 3;
        setrlimit(RLIMIT_NOFILE, &limit);
        EXPECT_EQ(run({"program"}), -1);
    });
}

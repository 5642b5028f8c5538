#pragma once

#include "tests/support/Eventually.h"
#include "tests/support/Temp_Folder.h"

#include <gtest/gtest.h>

#include <csignal>
#include <vector>

#include <fcntl.h>
#include <pty.h>
#include <sys/wait.h>
#include <unistd.h>

namespace KPRV {

/// A `kldrcim` at work: what it writes can be waited for, and it can be sent signals and answers.
class Kldrcim_Process
{
public:
    enum Input
    {
        NOTHING,
        TERMINAL,
    };

    Kldrcim_Process(const char* program, std::vector<std::string> arguments, Input input = NOTHING)
    {
        std::vector<char*> words = {const_cast<char*>(program)};
        for (std::string& argument : arguments)
            words.push_back(argument.data());
        words.push_back(nullptr);
        _child = input == TERMINAL ? forkpty(&_terminal, nullptr, nullptr, nullptr) : fork();
        if (_child != 0)
            return;
        redirect(input == TERMINAL ? STDIN_FILENO : open("/dev/null", O_RDONLY), STDIN_FILENO);
        redirect(open(_folder.path("out").c_str(), O_WRONLY | O_CREAT, 0600), STDOUT_FILENO);
        redirect(open(_folder.path("error").c_str(), O_WRONLY | O_CREAT, 0600), STDERR_FILENO);
        for (const int number : {SIGINT, SIGTERM, SIGHUP})
            std::signal(number, SIG_DFL);
        execv(program, words.data());
        _exit(127);
    }
    ~Kldrcim_Process()
    {
        if (_child > 0) {
            kill(_child, SIGKILL);
            waitpid(_child, nullptr, 0);
        }
        if (_terminal >= 0)
            close(_terminal);
    }
    Kldrcim_Process(const Kldrcim_Process&) = delete;
    Kldrcim_Process& operator=(const Kldrcim_Process&) = delete;

    std::string out() const { return _folder.read("out"); }
    std::string error() const { return _folder.read("error"); }

    /// False if the words do not come on standard error, or on standard output.
    bool says(const std::string& words) const
    {
        return eventually([&] {
            return error().find(words) != std::string::npos || out().find(words) != std::string::npos;
        });
    }
    void send(int number) const { kill(_child, number); }
    void answer(const std::string& line) const
    {
        (void)!write(_terminal, (line + "\n").data(), line.size() + 1);
    }

    /// Waits for its end: the exit status, or minus the signal that has ended it.
    int status()
    {
        int status = 0;
        waitpid(_child, &status, 0);
        _child = -1;
        return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
    }

private:
    static void redirect(int from, int to)
    {
        if (from != to)
            dup2(from, to);
    }

    Temp_Folder _folder;
    pid_t _child = -1;
    int _terminal = -1;
};

} // namespace KPRV

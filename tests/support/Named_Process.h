#pragma once

#include <gtest/gtest.h>

#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>

namespace KPRV {

/// A process that goes by a name, from when it is up until the end of the scope. Every process of the host is
/// seen by all tests, so programs that start or miss one share the lock "process_list" in their
/// CMakeLists.txt.
class Named_Process
{
public:
    explicit Named_Process(const char* name)
    {
        int up[2];
        if (pipe(up) != 0)
            std::abort();
        _id = fork();
        if (_id == 0) {
            prctl(PR_SET_NAME, name);
            prctl(PR_SET_PDEATHSIG, SIGKILL);
            close(up[0]);
            close(up[1]);
            for (;;)
                pause();
        }
        // Ends when the child has closed its side.
        close(up[1]);
        char none;
        EXPECT_EQ(::read(up[0], &none, 1), 0);
        close(up[0]);
    }
    ~Named_Process()
    {
        end();
        waitpid(_id, nullptr, 0);
    }
    Named_Process(const Named_Process&) = delete;
    Named_Process& operator=(const Named_Process&) = delete;

    /// Leaves a zombie.
    void end() const
    {
        kill(_id, SIGKILL);
        siginfo_t info;
        waitid(P_PID, static_cast<id_t>(_id), &info, WEXITED | WNOWAIT);
    }

private:
    pid_t _id;
};

} // namespace KPRV

#pragma once

#include <gtest/gtest.h>

#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

namespace KPRV {

/// Expects that the body ends its process as an exception does that nobody catches. It runs in one of its
/// own, which says nothing and dumps no core.
template <class Body>
void expect_end_of_process(Body&& body)
{
    const pid_t child = fork();
    if (child == 0) {
        const rlimit none = {};
        setrlimit(RLIMIT_CORE, &none);
        close(STDERR_FILENO);
        body();
        _exit(0);
    }
    int status = 0;
    waitpid(child, &status, 0);
    EXPECT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == SIGABRT) << status;
}

} // namespace KPRV

#pragma once

#include <sys/wait.h>
#include <unistd.h>

#include <gtest/gtest.h>

namespace KPRV {

/// Runs a body that leaves traces in its process, such as an opened library, in a process of its own. True if
/// no expectation in it failed.
template <class Body>
void in_child(Body&& body)
{
    const pid_t child = fork();
    if (child == 0) {
        body();
        fflush(nullptr);
        _exit(testing::Test::HasFailure() ? 1 : 0);
    }
    int status = -1;
    waitpid(child, &status, 0);
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << "status " << status;
}

} // namespace KPRV

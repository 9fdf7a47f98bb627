// Processes of a test's own.
#ifndef BASALT_TESTS_SUPPORT_CHILD_H
#define BASALT_TESTS_SUPPORT_CHILD_H

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>

namespace basalt::test {

// Runs `work` in a forked child, which has ten seconds: its wait status, 0 unless it failed, died or hung.
template <class Work>
int in_child(Work work) {
    const pid_t child = fork();
    if (child == 0) {
        alarm(10);
        work();
        std::_Exit(testing::Test::HasFailure() ? 1 : 0);
    }
    int status = -1;
    waitpid(child, &status, 0);
    return status;
}

}  // namespace basalt::test

#endif

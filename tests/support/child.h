// Forked children of a test.
#ifndef BASALT_TESTS_SUPPORT_CHILD_H
#define BASALT_TESTS_SUPPORT_CHILD_H

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>

namespace basalt::test {

// Runs `work` in a forked child, which has ten seconds; its wait status is 0 unless it failed, died or hung.
template <class Work>
void in_child(Work work, int expected_status = 0) {
    const pid_t child = fork();
    if (child == 0) {
        alarm(10);
        work();
        std::_Exit(testing::Test::HasFailure() ? 1 : 0);
    }
    int status = -1;
    waitpid(child, &status, 0);
    EXPECT_EQ(status, expected_status) << "of the child";
}

}  // namespace basalt::test

#endif

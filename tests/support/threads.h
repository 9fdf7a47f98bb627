// Threads that do the same at once.
#ifndef BASALT_TESTS_SUPPORT_THREADS_H
#define BASALT_TESTS_SUPPORT_THREADS_H

#include <thread>
#include <vector>

namespace basalt::test {

// Calls work(0), work(1), ... each on a thread of its own, and waits for all.
template <class Work>
void run_threads(int count, const Work& work) {
    std::vector<std::thread> threads;
    for (int i = 0; i < count; ++i) {
        threads.emplace_back(work, i);
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
}

}  // namespace basalt::test

#endif

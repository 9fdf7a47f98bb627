// Watches the general-purpose heap and makes it fail (linked with --wrap for malloc, realloc and free). What
// malloc gives is filled, so that reading it before it is written shows.
#ifndef BASALT_TESTS_SUPPORT_HEAP_CALLS_H
#define BASALT_TESTS_SUPPORT_HEAP_CALLS_H

#include <cstddef>

namespace basalt::test {

inline constexpr unsigned char FRESH_BYTE = 0xA5;

// While alive, the n-th malloc or realloc from now on (n = 1, 2, ...) of this thread fails, once. Assertions
// of the test framework allocate, so end it before asserting.
class HeapFailure {
public:
    explicit HeapFailure(int nth);
    ~HeapFailure();
    HeapFailure(const HeapFailure&) = delete;
    HeapFailure& operator=(const HeapFailure&) = delete;
    static bool struck();  // whether a call was made to fail
};

// Bytes that this thread's last malloc or realloc asked for.
std::size_t last_heap_request();

// Blocks that this thread has taken and not given back.
long live_heap_blocks();

}  // namespace basalt::test

#endif

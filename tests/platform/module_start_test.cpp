// A host that is linked with the library and uses it before main.

#include <gtest/gtest.h>

#include "basalt/memory.h"
#include "basalt/platform.h"

namespace {

using vex_lib::vlSharedMemoryHeap;

// Which file's statics come up first is up to the order of linking; the priority puts this one ahead of all
// that have none.
struct EarlyUser {
    void* heap = vlSharedMemoryHeap::GetHeapHandle();
    char* block = static_cast<char*>(vlSharedMemoryHeap::Alloc(100));
    CString text = CString("\xC3\xA9") + L" early";
};
[[gnu::init_priority(1000)]] const EarlyUser early_user;

TEST(ModuleStart, shared_heap_serves_the_hosts_own_statics) {
    EXPECT_NE(early_user.heap, nullptr);
    EXPECT_EQ(early_user.heap, vlSharedMemoryHeap::GetHeapHandle());
    ASSERT_NE(early_user.block, nullptr);
    early_user.block[99] = 'x';
    vlSharedMemoryHeap::Free(early_user.block);
    EXPECT_EQ(early_user.text, L"é early");
}

}  // namespace

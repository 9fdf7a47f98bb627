// Loads and unloads the built library as a host does.

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <memory>
#include <tuple>

#include "basalt/frame.h"
#include "basalt/memory.h"
#include "basalt/platform.h"
#include "tests/support/open_descriptors.h"

namespace {

using vex_lib::vlSharedMemoryHeap;
using Module = std::unique_ptr<void, int (*)(void*)>;

Module load(int further_flags = 0) {
    return {dlopen(BASALT_LIBRARY_PATH, RTLD_NOW | RTLD_LOCAL | further_flags), dlclose};
}

// Settings are fresh, then changed; a text is converted (a first-use object); blocks stay for the unload.
void load_use_and_unload() {
    const Module module = load();
    ASSERT_NE(module, nullptr) << dlerror();
    const auto find = [&]<class Function>(Function*, const char* name) {
        return reinterpret_cast<Function*>(dlsym(module.get(), name));
    };
    const auto language = find(_languageVersion, "_Z16_languageVersionv");
    ASSERT_EQ(language(), 15U);
    find(_setLanguageVersion, "_Z19_setLanguageVersionj")(7);
    ASSERT_TRUE(language() == 7 && find(GetLastError, "_Z12GetLastErrorv")() == 0);
    for (const std::size_t size : {1U, 100U, 4096U, 1U << 20}) {
        const auto allocate = find(vlSharedMemoryHeap::Alloc, "_ZN7vex_lib18vlSharedMemoryHeap5AllocEm");
        static_cast<char*>(allocate(size))[size - 1] = 'x';
    }
    char narrow[9];
    find(_tchar2char, "_Z11_tchar2charPKwPci")(L"\xE9", narrow, 8);
}

// Pages, mappings and descriptors of the process; a sanitizer maps memory of its own.
auto footprint() {
    std::size_t pages = 0;
    long maps = 0;
    if (dlsym(RTLD_DEFAULT, "__sanitizer_print_stack_trace") == nullptr) {
        std::ifstream("/proc/self/statm") >> pages;
        std::ifstream file("/proc/self/maps");
        maps = std::count(std::istreambuf_iterator<char>(file), {}, '\n');
    }
    return std::tuple(pages, maps, basalt::test::open_descriptors());
}

TEST(ModuleLoad, a_thousand_loads_leave_nothing_behind) {
    auto before = footprint();
    for (int round = 0; round < 1010; ++round) {
        load_use_and_unload();
        ASSERT_EQ(load(RTLD_NOLOAD), nullptr) << "round " << round;
        before = round < 10 ? footprint() : before;  // after warming up
    }
    EXPECT_EQ(footprint(), before);
}

// The priority puts it ahead of all objects without one.
struct EarlyUser {
    HANDLE heap = vlSharedMemoryHeap::GetHeapHandle();
    void* block = vlSharedMemoryHeap::Alloc(100);
    CString text = CString("\xC3\xA9") + L" early";
};
[[gnu::init_priority(1000)]] const EarlyUser early_user;

TEST(ModuleLoad, the_shared_heap_serves_the_hosts_own_statics) {
    EXPECT_TRUE(early_user.heap == vlSharedMemoryHeap::GetHeapHandle() && early_user.block != nullptr);
    vlSharedMemoryHeap::Free(early_user.block);
    EXPECT_EQ(early_user.text, L"\u00e9 early");
}

}  // namespace

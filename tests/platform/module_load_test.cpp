// Loads and unloads the built library as a host does.

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <memory>
#include <string>

#include "basalt/memory.h"
#include "basalt/platform.h"
#include "tests/support/open_descriptors.h"

namespace {

using vex_lib::vlSharedMemoryHeap;
using Module = std::unique_ptr<void, int (*)(void*)>;

Module load(int further_flags = 0) {
    return {dlopen(BASALT_LIBRARY_PATH, RTLD_NOW | RTLD_LOCAL | further_flags), dlclose};
}

template <class Function>
Function* function_of(const Module& module, const char* mangled_name) {
    return reinterpret_cast<Function*>(dlsym(module.get(), mangled_name));
}

// Settings are fresh, then changed; a text is converted (a first-use object); blocks stay for the unload.
void load_use_and_unload() {
    const Module module = load();
    ASSERT_NE(module, nullptr) << dlerror();
    auto* const language = function_of<std::uint32_t()>(module, "_Z16_languageVersionv");
    ASSERT_EQ(language(), 15U);
    function_of<void(std::uint32_t)>(module, "_Z19_setLanguageVersionj")(7);
    ASSERT_EQ(language(), 7U);
    ASSERT_EQ(function_of<std::uint32_t()>(module, "_Z12GetLastErrorv")(), 0U);
    auto* const allocate = function_of<void*(std::size_t)>(module, "_ZN7vex_lib18vlSharedMemoryHeap5AllocEm");
    for (const std::size_t size : {1U, 100U, 4096U, 1U << 20}) {
        static_cast<char*>(allocate(size))[size - 1] = 'x';
    }
    // Short enough to stay inside the object, which therefore needs no destruction.
    alignas(std::wstring) char text[sizeof(std::wstring)];
    function_of<void(void*, const char*)>(module, "_ZN7CStringC1EPKc")(text, "\xC3\xA9");
}

struct Footprint {
    std::size_t pages = 0;
    long maps = 0;
    long descriptors = basalt::test::open_descriptors();
    Footprint() {
        if (dlsym(RTLD_DEFAULT, "__sanitizer_print_stack_trace") ==
            nullptr) {  // a sanitizer maps its own memory
            std::ifstream("/proc/self/statm") >> pages;
            std::ifstream file("/proc/self/maps");
            maps = std::count(std::istreambuf_iterator<char>(file), {}, '\n');
        }
    }
    bool operator==(const Footprint&) const = default;
};

TEST(Module, a_thousand_loads_leave_nothing_behind) {
    Footprint before;
    for (int warm_up = 0; warm_up < 10; ++warm_up) {
        load_use_and_unload();
        before = Footprint();
    }
    for (int round = 0; round < 1000; ++round) {
        load_use_and_unload();
        ASSERT_EQ(load(RTLD_NOLOAD), nullptr) << "round " << round;
    }
    EXPECT_TRUE(Footprint() == before);
}

// The priority puts it ahead of all objects without one.
struct EarlyUser {
    HANDLE heap = vlSharedMemoryHeap::GetHeapHandle();
    void* block = vlSharedMemoryHeap::Alloc(100);
    CString text = CString("\xC3\xA9") + L" early";
};
[[gnu::init_priority(1000)]] const EarlyUser early_user;

TEST(Module, the_shared_heap_serves_the_hosts_own_statics) {
    EXPECT_EQ(early_user.heap, vlSharedMemoryHeap::GetHeapHandle());
    ASSERT_NE(early_user.block, nullptr);
    vlSharedMemoryHeap::Free(early_user.block);
    EXPECT_EQ(early_user.text, L"\u00e9 early");
}

}  // namespace

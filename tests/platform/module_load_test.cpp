// Loads and unloads the built library as a host does.

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <memory>
#include <string>

#include "tests/support/open_descriptors.h"

namespace {

constexpr char LIBRARY[] = BASALT_LIBRARY_PATH;

// A sanitizer maps memory for itself as it goes.
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
constexpr bool MAPPINGS_ARE_OURS = false;
#elif defined(__has_feature)
constexpr bool MAPPINGS_ARE_OURS = !__has_feature(address_sanitizer) && !__has_feature(thread_sanitizer);
#else
constexpr bool MAPPINGS_ARE_OURS = true;
#endif

struct Unload {
    void operator()(void* library) const { dlclose(library); }
};
using Module = std::unique_ptr<void, Unload>;

Module load(int further_flags = 0) {
    return Module(dlopen(LIBRARY, RTLD_NOW | RTLD_LOCAL | further_flags));
}

// A function by its mangled name.
template <class Function>
Function* function_of(const Module& module, const char* symbol) {
    return module != nullptr ? reinterpret_cast<Function*>(dlsym(module.get(), symbol)) : nullptr;
}

std::size_t mapped_pages() {
    std::size_t pages = 0;
    std::ifstream("/proc/self/statm") >> pages;
    return pages;
}

std::size_t mappings() {
    std::ifstream maps("/proc/self/maps");
    return static_cast<std::size_t>(std::count(std::istreambuf_iterator<char>(maps), {}, '\n'));
}

// One run of a host: settings are fresh, then changed; texts are converted (a first-use object); blocks of
// the shared heap, small ones and one with a region of its own, are left behind for the unloading to release.
void load_use_and_unload() {
    const Module module = load();
    auto* const language = function_of<std::uint32_t()>(module, "_Z16_languageVersionv");
    auto* const set_language = function_of<void(std::uint32_t)>(module, "_Z19_setLanguageVersionj");
    auto* const operating_system = function_of<std::uint32_t()>(module, "_Z16_operatingsystemv");
    auto* const last_error = function_of<std::uint32_t()>(module, "_Z12GetLastErrorv");
    auto* const allocate = function_of<void*(std::size_t)>(module, "_ZN7vex_lib18vlSharedMemoryHeap5AllocEm");
    auto* const construct_text = function_of<void(void*, const char*)>(module, "_ZN7CStringC1EPKc");
    ASSERT_TRUE(language && set_language && operating_system && last_error && allocate && construct_text);
    ASSERT_EQ(language(), 15U);
    set_language(7);
    ASSERT_EQ(language(), 7U);
    ASSERT_EQ(operating_system(), 11U);
    ASSERT_EQ(last_error(), 0U);
    for (const std::size_t size : {1U, 100U, 4096U, 1U << 20}) {
        auto* const block = static_cast<char*>(allocate(size));
        ASSERT_NE(block, nullptr);
        block[0] = block[size - 1] = 'x';
    }
    // Short enough to stay inside the object, which therefore needs no destruction.
    alignas(std::wstring) char text[sizeof(std::wstring)];
    construct_text(text, "\xC3\xA9");
}

struct Footprint {
    std::size_t pages = mapped_pages();
    std::size_t maps = mappings();
    long descriptors = basalt::test::open_descriptors();
};

TEST(ModuleLoad, a_thousand_loads_leave_nothing_behind) {
    // Taking the measure needs memory as well, so the first one does not count.
    Footprint before;
    for (int warm_up = 0; warm_up < 10; ++warm_up) {
        load_use_and_unload();
        before = Footprint();
    }
    for (int round = 0; round < 1000; ++round) {
        load_use_and_unload();
        ASSERT_EQ(load(RTLD_NOLOAD), nullptr) << "round " << round;
    }
    const Footprint after;
    EXPECT_EQ(after.descriptors, before.descriptors);
    if (MAPPINGS_ARE_OURS) {
        EXPECT_EQ(after.pages, before.pages);
        EXPECT_EQ(after.maps, before.maps);
    }
}

}  // namespace

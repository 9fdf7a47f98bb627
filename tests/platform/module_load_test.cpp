// Loads and unloads the built library as a host does.

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
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

class Module {
public:
    Module() : m_handle(dlopen(LIBRARY, RTLD_NOW | RTLD_LOCAL)) {}
    ~Module() {
        if (m_handle != nullptr) {
            dlclose(m_handle);
        }
    }
    Module(const Module&) = delete;
    Module& operator=(const Module&) = delete;

    // A function by its mangled name.
    template <class Function>
    Function* get(const char* symbol) const {
        return m_handle != nullptr ? reinterpret_cast<Function*>(dlsym(m_handle, symbol)) : nullptr;
    }

private:
    void* m_handle;
};

bool is_loaded() {
    void* const handle = dlopen(LIBRARY, RTLD_NOW | RTLD_NOLOAD);
    if (handle != nullptr) {
        dlclose(handle);
    }
    return handle != nullptr;
}

std::size_t mapped_kilobytes() {
    std::ifstream status("/proc/self/status");
    for (std::string word; status >> word;) {
        if (word == "VmSize:") {
            std::size_t kilobytes = 0;
            status >> kilobytes;
            return kilobytes;
        }
    }
    return 0;
}

std::size_t mappings() {
    std::ifstream maps("/proc/self/maps");
    return static_cast<std::size_t>(std::count(std::istreambuf_iterator<char>(maps), {}, '\n'));
}

// One run of a host: settings are fresh, then changed; texts are converted (a first-use object); blocks of
// the shared heap, small ones and one with a region of its own, are left behind for the unloading to release.
void load_use_and_unload() {
    const Module module;
    auto* const language = module.get<std::uint32_t()>("_Z16_languageVersionv");
    auto* const set_language = module.get<void(std::uint32_t)>("_Z19_setLanguageVersionj");
    auto* const operating_system = module.get<std::uint32_t()>("_Z16_operatingsystemv");
    auto* const last_error = module.get<std::uint32_t()>("_Z12GetLastErrorv");
    auto* const allocate = module.get<void*(std::size_t)>("_ZN7vex_lib18vlSharedMemoryHeap5AllocEm");
    auto* const construct_text = module.get<void(void*, const char*)>("_ZN7CStringC1EPKc");
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
    std::size_t kilobytes = mapped_kilobytes();
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
        ASSERT_FALSE(is_loaded()) << "round " << round;
    }
    const Footprint after;
    EXPECT_EQ(after.descriptors, before.descriptors);
    if (MAPPINGS_ARE_OURS) {
        EXPECT_EQ(after.kilobytes, before.kilobytes);
        EXPECT_EQ(after.maps, before.maps);
    }
}

}  // namespace

// Locales of other encodings, made at test time with localedef.
#ifndef BASALT_TESTS_SUPPORT_LOCALES_H
#define BASALT_TESTS_SUPPORT_LOCALES_H

#include <cstdlib>
#include <filesystem>
#include <optional>
#include <string>

#include "tests/support/scratch_folder.h"

namespace test_locales {

// The folder that LOCPATH names. A death test that runs the program again inherits that of its parent.
class Folder {
public:
    Folder() {
        if (std::getenv("LOCPATH") == nullptr) {
            setenv("LOCPATH", m_own.emplace().path().c_str(), 1);
        }
    }
    ~Folder() { static_cast<void>(m_own ? unsetenv("LOCPATH") : 0); }
    Folder(const Folder&) = delete;
    Folder& operator=(const Folder&) = delete;

    // Makes a locale with an encoding, and its name; false if localedef or its sources are missing.
    static bool has(const std::string& encoding) {
        const std::string path = std::getenv("LOCPATH") + ("/" + encoding);
        const std::string make = "localedef -c -i POSIX -f " + encoding + " '" + path + "' >/dev/null 2>&1";
        return std::filesystem::exists(path) ||
               (std::system(make.c_str()) != -1 && std::filesystem::exists(path + "/LC_CTYPE"));
    }
    static void enter(const std::string& encoding) { setenv("LC_ALL", encoding.c_str(), 1); }

private:
    std::optional<basalt::test::ScratchFolder> m_own;
};

}  // namespace test_locales

#endif

// Locales other than the system's own, made at test time with localedef.
#ifndef BASALT_TESTS_SUPPORT_LOCALES_H
#define BASALT_TESTS_SUPPORT_LOCALES_H

#include <cstdlib>
#include <filesystem>
#include <optional>
#include <string>

#include "tests/support/scratch_folder.h"

namespace test_locales {

// A folder for LOCPATH with one locale for each encoding asked for, of that name; it goes with the object.
// The process of a death test, which begins anew, finds the folder of the process that started it.
class Folder {
public:
    Folder() {
        if (const char* const inherited = std::getenv(VARIABLE)) {
            m_path = inherited;
        } else {
            m_path = m_own.emplace().path();
            setenv(VARIABLE, m_path.c_str(), 1);
        }
    }
    ~Folder() {
        if (m_own) {
            unsetenv(VARIABLE);
        }
    }
    Folder(const Folder&) = delete;
    Folder& operator=(const Folder&) = delete;

    // Whether the locale is there, made now if need be; false where localedef or its sources are missing.
    bool has(const std::string& encoding) const {
        const std::filesystem::path locale = m_path / encoding;
        if (!std::filesystem::exists(locale)) {
            const std::string command =
                "localedef -c -i POSIX -f " + encoding + " '" + locale.string() + "' >/dev/null 2>&1";
            if (std::system(command.c_str()) == -1) {
                return false;
            }
        }
        return std::filesystem::exists(locale / "LC_CTYPE");
    }

    // Makes the encoding the environment's.
    void enter(const std::string& encoding) const {
        setenv("LOCPATH", m_path.c_str(), 1);
        setenv("LC_ALL", encoding.c_str(), 1);
    }

private:
    static constexpr char VARIABLE[] = "BASALT_TEST_LOCALES";

    std::optional<basalt::test::ScratchFolder> m_own;
    std::filesystem::path m_path;
};

}  // namespace test_locales

#endif

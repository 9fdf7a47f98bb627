// A folder for one test, TMPDIR while it lives, deleted at the end with its contents.
#ifndef BASALT_TESTS_SUPPORT_SCRATCH_FOLDER_H
#define BASALT_TESTS_SUPPORT_SCRATCH_FOLDER_H

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <set>
#include <string>

namespace basalt::test {

class ScratchFolder {
public:
    ScratchFolder() { set_temporary(mkdtemp(m_path.data()) != nullptr ? m_path : ""); }
    ~ScratchFolder() {
        set_temporary(m_before);
        std::filesystem::remove_all(m_path);
    }
    ScratchFolder(const ScratchFolder&) = delete;
    ScratchFolder& operator=(const ScratchFolder&) = delete;

    static void set_temporary(const std::string& path) { setenv("TMPDIR", path.c_str(), 1); }

    const std::string& path() const { return m_path; }
    std::string operator/(const std::string& name) const { return m_path + "/" + name; }
    std::wstring wide(const std::wstring& name) const {
        return std::wstring(m_path.begin(), m_path.end()) + L"/" + name;
    }
    std::set<std::string> names() const {
        std::set<std::string> found;
        for (const auto& entry : std::filesystem::directory_iterator(m_path)) {
            found.insert(entry.path().filename().string());
        }
        return found;
    }
    std::string read(const std::string& name) const {
        std::ifstream stream(*this / name, std::ios::binary);
        return std::string(std::istreambuf_iterator<char>(stream), {});
    }
    void write(const std::string& name, const std::string& text = "") const {
        std::ofstream(*this / name) << text;
    }

private:
    std::string m_before = std::filesystem::temp_directory_path();
    std::string m_path = m_before + "/basalt-XXXXXX";
};

}  // namespace basalt::test

#endif

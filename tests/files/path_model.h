// The path classes in their plainest form.
#ifndef BASALT_TESTS_FILES_PATH_MODEL_H
#define BASALT_TESTS_FILES_PATH_MODEL_H

#include <string>

namespace path_model {

struct Parts {
    std::wstring drive, directory, name, extension;
    bool valid = false;
};

inline Parts split(const std::wstring& path) {
    const std::size_t drive = path.size() > 1 && path[1] == L':' ? 2 : 0;
    const std::size_t slash = path.find_last_of(L"\\/");
    const std::size_t name = slash == std::wstring::npos || slash < drive ? drive : slash + 1;
    const std::size_t last_dot = path.rfind(L'.');
    const std::size_t dot = last_dot == std::wstring::npos || last_dot < name ? path.size() : last_dot;
    const bool valid = name - drive <= 255 && dot - name <= 255 && path.size() - dot <= 255;
    return valid ? Parts{path.substr(0, drive), path.substr(drive, name - drive),
                         path.substr(name, dot - name), path.substr(dot), true}
                 : Parts{};
}

inline std::wstring select(const Parts& parts, unsigned selector) {
    return (selector % 2 >= 1 ? parts.drive : L"") + (selector % 4 >= 2 ? parts.directory : L"") +
           (selector % 8 >= 4 ? parts.name : L"") + (selector % 16 >= 8 ? parts.extension : L"");
}

// The members of a file path; the caller knows whether a path is an existing directory.
struct FilePath {
    std::wstring full, drive, directory, name, extension;

    void set(const std::wstring& path, bool is_directory) {
        full = path;
        if (path.empty()) {
            return;
        }
        const Parts parts = split(path);
        drive = parts.drive;
        name = parts.name;
        extension = parts.extension.substr(parts.extension.empty() ? 0 : 1);
        const std::size_t size = parts.directory.size();
        const std::size_t first = size > 1 && parts.directory.find_first_of(L"\\/") == 0 ? 1 : 0;
        directory = size == 0 ? L"" : parts.directory.substr(first, size - 1 - first);
        if (parts.valid && is_directory) {
            directory += L"\\" + name + parts.extension;
            name.clear();
        }
    }
};

}  // namespace path_model

#endif

// The path classes in their plainest form: what fast code is held against, in tests and by a fuzzer.
#ifndef BASALT_TESTS_FILES_PATH_MODEL_H
#define BASALT_TESTS_FILES_PATH_MODEL_H

#include <string>

namespace path_model {

inline bool is_separator(wchar_t ch) {
    return ch == L'\\' || ch == L'/';
}

struct Parts {
    std::wstring drive, directory, name, extension;
    bool valid = false;
};

// One character after the other, each into the part that it belongs to as far as one has read.
inline Parts split(const std::wstring& path) {
    Parts parts;
    std::size_t at = 0;
    if (path.size() >= 2 && path[1] == L':') {
        parts.drive = path.substr(0, 2);
        at = 2;
    }
    for (; at < path.size(); ++at) {
        if (is_separator(path[at])) {
            parts.directory += parts.name + parts.extension + path[at];
            parts.name.clear();
            parts.extension.clear();
        } else if (path[at] == L'.') {
            parts.name += parts.extension;
            parts.extension = L".";
        } else {
            (parts.extension.empty() ? parts.name : parts.extension) += path[at];
        }
    }
    parts.valid = parts.directory.size() <= 255 && parts.name.size() <= 255 && parts.extension.size() <= 255;
    return parts.valid ? parts : Parts{};
}

inline std::wstring select(const Parts& parts, unsigned selector) {
    return (selector % 2 >= 1 ? parts.drive : L"") + (selector % 4 >= 2 ? parts.directory : L"") +
           (selector % 8 >= 4 ? parts.name : L"") + (selector % 16 >= 8 ? parts.extension : L"");
}

// The members of a file path set to a path; whether that is an existing directory is told by the caller.
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
        directory = parts.directory;
        if (!directory.empty() && is_separator(directory.back())) {
            directory.pop_back();
        }
        if (!directory.empty() && is_separator(directory.front())) {
            directory.erase(0, 1);
        }
        extension = parts.extension.empty() ? L"" : parts.extension.substr(1);
        if (parts.valid && is_directory) {
            directory += L"\\" + name + parts.extension;
            name.clear();
        }
    }
};

}  // namespace path_model

#endif

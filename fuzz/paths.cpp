// The path classes against their model, on paths in and around a small tree of folders.
#include <cstdint>
#include <filesystem>
#include <string>

#include "basalt/files.h"
#include "fuzz/input.h"
#include "src/platform/text/file_name.h"
#include "tests/support/scratch_folder.h"

namespace {

using basalt::fuzz::require;
using vex_util::CFilePath;
using vex_util::Path;
namespace fs = std::filesystem;

// The folder's path with its tree made.
std::wstring tree() {
    static const basalt::test::ScratchFolder s_folder;
    static const bool s_made = fs::create_directories(s_folder / "dir/site.2024");
    require(s_made);
    return s_folder.wide(L"");
}

std::wstring path_of(const std::uint8_t* data, std::size_t size) {
    constexpr std::wstring_view PIECES[] = {L"\\",     L"/",      L".",       L":",           L"*",
                                            L"?",      L"..",     L"/dir",    L"\\site.2024", L"\\file.txt",
                                            L"\xDC80", L"\xFFFD", L"\x1F30D", L"\xD800"};
    std::wstring path;
    for (std::size_t i = 0; i < size; ++i) {
        if (data[i] == 255) {
            path.append(i + 1 < size ? data[i + 1] : 0, L'n');
        } else if (data[i] != 0) {
            path += data[i] >= 128 ? PIECES[data[i] % std::size(PIECES)] : std::wstring(1, data[i]);
        }
    }
    return path.substr(0, 2'000);
}

CString text(const std::wstring& characters) {
    return CString(characters.c_str(), static_cast<int>(characters.size()));
}

bool is_directory(const std::wstring& path) {
    const std::wstring last = path.substr(path.find_last_of(L"\\/") + 1);
    std::error_code error;
    return last.find_first_of(L"*?") != std::wstring::npos
               ? CFilePath::IsDirectory(text(path))
               : !last.empty() && fs::is_directory(basalt::platform::file_name_from_wide(path), error);
}

struct Parts {
    std::wstring drive, directory, name, extension;
    bool valid = false;
};

Parts split(const std::wstring& path) {
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

std::wstring select(const Parts& parts, unsigned selector) {
    return (selector % 2 >= 1 ? parts.drive : L"") + (selector % 4 >= 2 ? parts.directory : L"") +
           (selector % 8 >= 4 ? parts.name : L"") + (selector % 16 >= 8 ? parts.extension : L"");
}

// The members of a file path.
struct FilePath : Parts {
    std::wstring full;

    void set(const std::wstring& path) {
        full = path;
        if (path.empty()) {
            return;
        }
        static_cast<Parts&>(*this) = split(path);
        const std::size_t size = directory.size(),
                          first = size > 1 && directory.find_first_of(L"\\/") == 0 ? 1 : 0;
        directory = directory.substr(first, size == 0 ? 0 : size - 1 - first);
        if (valid && is_directory(path)) {
            directory += L"\\" + name + extension;
            name.clear();
        }
        extension.erase(0, 1);
    }
    std::wstring folder() const { return drive + L"\\" + directory; }
    std::wstring file() const { return name.empty() || extension.empty() ? L"" : name + L"." + extension; }
};

void require_same(const CFilePath& path, const FilePath& model) {
    require(static_cast<const CString&>(path) == text(model.full) && path.Drive() == text(model.drive) &&
            path.DirectoryOnly() == text(model.directory) && path.FileNameOnly() == text(model.name) &&
            path.Extension() == text(model.extension) && path.Directory() == text(model.folder()) &&
            path.FileName() == text(model.file()));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    if (size < 2) {
        return 0;
    }
    const std::size_t half = data[0] * (size - 2) / 255;
    const std::wstring first = (data[1] % 2 == 0 ? tree() : L"") + path_of(data + 2, half);
    const std::wstring second = path_of(data + 2 + half, size - 2 - half);
    require(Path::GetPath(text(first + second), data[1]) == text(select(split(first + second), data[1])));
    CFilePath path(text(first));
    FilePath model;
    model.set(first);
    require_same(path, model);
    path.Combine(path.Extension(), text(second));
    model.set(model.extension + L"\\" + second);
    require_same(path, model);
    path.SetExtension(text(second));
    model.extension = second;
    model.set(model.folder() + L"\\" + model.file());
    require_same(path, model);
    return 0;
}

// The path classes against their model, on paths in and around a small tree of folders.
#include <cstdint>
#include <filesystem>
#include <string>

#include "basalt/files.h"
#include "fuzz/input.h"
#include "src/platform/text/file_name.h"
#include "tests/files/path_model.h"
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
    std::string name;
    std::error_code error;
    return last.find_first_of(L"*?") != std::wstring::npos
               ? CFilePath::IsDirectory(text(path))
               : !last.empty() && basalt::platform::file_name_from_wide(path, name) &&
                     fs::is_directory(name, error);
}

void set(path_model::FilePath& model, const std::wstring& path) {
    model.set(path, is_directory(path));
}

void require_same(const CFilePath& path, const path_model::FilePath& model) {
    const bool has_name = !model.name.empty() && !model.extension.empty();
    require(static_cast<const CString&>(path) == text(model.full) && path.Drive() == text(model.drive) &&
            path.DirectoryOnly() == text(model.directory) && path.FileNameOnly() == text(model.name) &&
            path.Extension() == text(model.extension) &&
            path.Directory() == text(model.drive + L"\\" + model.directory) &&
            path.FileName() == text(has_name ? model.name + L"." + model.extension : L""));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    if (size < 2) {
        return 0;
    }
    const std::size_t half = data[0] * (size - 2) / 255;
    const std::wstring first = (data[1] % 2 == 0 ? tree() : L"") + path_of(data + 2, half);
    const std::wstring second = path_of(data + 2 + half, size - 2 - half);
    const path_model::Parts parts = path_model::split(first + second);
    require(Path::GetPath(text(first + second), data[1]) == text(path_model::select(parts, data[1])));
    CFilePath path(text(first));
    path_model::FilePath model;
    set(model, first);
    require_same(path, model);
    path.Combine(path.Extension(), text(second));
    set(model, model.extension + L"\\" + second);
    require_same(path, model);
    path.SetExtension(text(second));
    model.extension = second;
    const std::wstring name = model.name.empty() || second.empty() ? L"" : model.name + L"." + second;
    set(model, model.drive + L"\\" + model.directory + L"\\" + name);
    require_same(path, model);
    return 0;
}

// The path classes against their model, on any path. The disk is asked about names that are not there.
#include <cstdint>
#include <string>

#include "basalt/files.h"
#include "fuzz/input.h"
#include "tests/files/path_model.h"

namespace {

using basalt::fuzz::require;
using vex_util::CFilePath;
using vex_util::Path;

// Below a folder that does not exist, so that the answers do not depend on the machine.
constexpr wchar_t NOWHERE[] = L"no such folder/";

// The input's characters: mostly those that paths turn on, now and then a long run.
std::wstring path_of(const std::uint8_t* data, std::size_t size) {
    constexpr wchar_t SPECIAL[] = {L'\\', L'/',      L'.',      L':',       L'*',
                                   L'?',  L'\xDC80', L'\xFFFD', L'\x1F30D', L'\xD800'};
    std::wstring path;
    for (std::size_t i = 0; i < size && path.size() < 2'000; ++i) {
        const unsigned value = data[i];
        if (value == 255 && i + 1 < size) {
            path.append(data[++i], L'n');
        } else if (value >= 128) {
            path += SPECIAL[value % std::size(SPECIAL)];
        } else if (value != 0) {
            path += static_cast<wchar_t>(value);
        }
    }
    return path;
}

CString text(const std::wstring& characters) {
    return CString(characters.c_str(), static_cast<int>(characters.size()));
}

void check_selector(const std::wstring& path, unsigned selector) {
    const path_model::Parts parts = path_model::split(path);
    require(Path::GetPath(text(path), static_cast<unsigned char>(selector)) ==
            text(path_model::select(parts, selector)));
    require(Path(text(path)).GetPath(15) == text(parts.valid ? path : L""));
}

void require_same(const CFilePath& path, const path_model::FilePath& model) {
    require(static_cast<const CString&>(path) == text(model.full));
    require(path.Drive() == text(model.drive));
    require(path.DirectoryOnly() == text(model.directory));
    require(path.FileNameOnly() == text(model.name));
    require(path.Extension() == text(model.extension));
}

void check_file_path(const std::wstring& first, const std::wstring& second) {
    CFilePath path;
    path_model::FilePath model;
    CString wide = text(first);
    path = wide;
    model.set(first, false);
    require_same(path, model);

    path.Combine(path.Extension(), text(second));
    model.set(model.extension + L"\\" + second, path.IsDirectory());
    require_same(path, model);

    path.SetExtension(text(second));
    const std::wstring name = model.name.empty() || second.empty() ? L"" : model.name + L"." + second;
    const std::wstring combined = model.drive + L"\\" + model.directory + L"\\" + name;
    model.extension = second;
    model.set(combined, path.IsDirectory());
    require_same(path, model);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    if (size < 2) {
        return 0;
    }
    const std::size_t half = data[0] * (size - 2) / 255;
    const std::wstring first = path_of(data + 2, half);
    const std::wstring second = path_of(data + 2 + half, size - 2 - half);
    check_selector(first, data[1]);
    check_selector(first + second, data[1] * 7U);
    check_file_path(NOWHERE + first, second);
    return 0;
}

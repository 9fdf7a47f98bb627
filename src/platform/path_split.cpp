#include "src/platform/path_split.h"

#include <algorithm>
#include <cerrno>
#include <string_view>

namespace {

struct Part {
    std::wstring_view text;
    wchar_t* buffer;
    std::size_t size;
};

}  // namespace

errno_t _wsplitpath_s(const wchar_t* path, wchar_t* drive, std::size_t drive_size, wchar_t* directory,
                      std::size_t directory_size, wchar_t* name, std::size_t name_size, wchar_t* extension,
                      std::size_t extension_size) {
    *drive = *directory = *name = *extension = L'\0';
    if (path == nullptr) {
        return EINVAL;
    }
    const std::wstring_view all = path;
    const std::size_t drive_end = all.size() > 1 && all[1] == L':' ? 2 : 0;
    std::size_t dot = all.size();
    std::size_t name_start = all.size();
    for (; name_start > drive_end; --name_start) {
        const wchar_t ch = all[name_start - 1];
        if (ch == L'\\' || ch == L'/') {
            break;
        }
        if (ch == L'.' && dot == all.size()) {
            dot = name_start - 1;
        }
    }
    const Part parts[] = {
        {all.substr(0, drive_end), drive, drive_size},
        {all.substr(drive_end, name_start - drive_end), directory, directory_size},
        {all.substr(name_start, dot - name_start), name, name_size},
        {all.substr(dot), extension, extension_size},
    };
    if (std::any_of(std::begin(parts), std::end(parts),
                    [](const Part& part) { return part.text.size() >= part.size; })) {
        return ERANGE;
    }
    for (const Part& part : parts) {
        part.buffer[part.text.copy(part.buffer, part.text.size())] = L'\0';
    }
    return 0;
}

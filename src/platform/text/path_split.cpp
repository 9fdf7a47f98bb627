#include "src/platform/path_split.h"

#include <algorithm>

namespace basalt::platform {

bool split_path(std::wstring_view path, PathParts& parts) {
    constexpr std::size_t MAX_PART = 255;
    const std::size_t drive_end = path.size() > 1 && path[1] == L':' ? 2 : 0;
    std::size_t dot = path.size();
    std::size_t name_start = path.size();
    for (; name_start > drive_end; --name_start) {
        const wchar_t ch = path[name_start - 1];
        if (is_separator(ch)) {
            break;
        }
        if (ch == L'.' && dot == path.size()) {
            dot = name_start - 1;
        }
    }
    const std::size_t directory = name_start - drive_end;
    const std::size_t name = dot - name_start;
    const bool fits = std::max({directory, name, path.size() - dot}) <= MAX_PART;
    parts = fits ? PathParts{path.substr(0, drive_end), path.substr(drive_end, directory),
                             path.substr(name_start, name), path.substr(dot)}
                 : PathParts{};
    return fits;
}

}  // namespace basalt::platform

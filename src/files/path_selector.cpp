#include <algorithm>

#include "basalt/files.h"
#include "src/platform/path_split.h"

namespace vex_util {

Path::Path(const CString& path) {
    basalt::platform::PathParts parts;
    if (!path.IsEmpty() && split_path(path.GetString(), parts)) {
        m_path = path;
        const std::wstring_view in_order[PARTS] = {parts.drive, parts.directory, parts.name, parts.extension};
        for (int part = 0; part < PARTS; ++part) {
            m_bounds[part + 1] = m_bounds[part] + static_cast<int>(in_order[part].size());
        }
    }
}

Path::Path(const Path& other) = default;
Path& Path::operator=(const Path& other) = default;
Path::~Path() = default;

const CString& Path::GetPath(unsigned char selector) const {
    const auto is_selected = [selector](int part) { return (selector >> part & 1) != 0; };
    int length = 0;
    for (int part = 0; part < PARTS; ++part) {
        length += is_selected(part) ? m_bounds[part + 1] - m_bounds[part] : 0;
    }
    const wchar_t* const path = m_path.GetString();
    wchar_t* end = m_result.GetBuffer(length);
    for (int part = 0; part < PARTS;) {
        // Adjacent parts are copied together.
        int next = part;
        while (next < PARTS && is_selected(next)) {
            ++next;
        }
        end = std::copy(path + m_bounds[part], path + m_bounds[next], end);
        part = next + 1;
    }
    m_result.ReleaseBuffer(length);
    return m_result;
}

CString Path::GetPath(const CString& path, unsigned char selector) {
    return Path(path).GetPath(selector);
}

}  // namespace vex_util

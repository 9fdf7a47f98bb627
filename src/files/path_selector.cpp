#include "basalt/files.h"
#include "src/platform/path_split.h"

namespace {

CString text_of(std::wstring_view part) {
    return {part.data(), static_cast<int>(part.size())};
}

}  // namespace

namespace vex_util {

Path::Path(const CString& path) {
    basalt::platform::PathParts parts;
    if (!path.IsEmpty() && split_path(path.GetString(), parts)) {
        m_drive = text_of(parts.drive);
        m_directory = text_of(parts.directory);
        m_name = text_of(parts.name);
        m_extension = text_of(parts.extension);
        m_valid = true;
    }
}

Path::Path(const Path& other) = default;
Path& Path::operator=(const Path& other) = default;
Path::~Path() = default;

const CString& Path::GetPath(unsigned char selector) const {
    m_result.Empty();
    if (m_valid) {
        if ((selector & DRIVE) != 0) {
            m_result += m_drive;
        }
        if ((selector & DIRECTORY) != 0) {
            m_result += m_directory;
        }
        if ((selector & NAME) != 0) {
            m_result += m_name;
        }
        if ((selector & EXTENSION) != 0) {
            m_result += m_extension;
        }
    }
    return m_result;
}

CString Path::GetPath(const CString& path, unsigned char selector) {
    return Path(path).GetPath(selector);
}

}  // namespace vex_util

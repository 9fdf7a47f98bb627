#include "basalt/files.h"
#include "src/files/path_parts.h"

namespace vex_util {

Path::Path(const CString& path) {
    basalt::files::PathParts parts;
    if (!path.IsEmpty() && parts.split(path)) {
        m_drive += parts.drive;
        m_directory += parts.directory;
        m_name += parts.name;
        m_extension += parts.extension;
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

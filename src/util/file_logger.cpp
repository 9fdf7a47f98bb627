#include "basalt/util/file_logger.h"

#include "src/platform/text_file.h"

namespace vex_util {

FileLogger::FileLogger() : FileLogger(nullptr) {}

FileLogger::FileLogger(const char* path) {
    Open(path);
}

FileLogger::~FileLogger() = default;

void FileLogger::Open(const char* path) {
    Close();
    if (path != nullptr && *path != '\0') {
        m_file = basalt::platform::TextFile::open(path);
    }
}

void FileLogger::Close() {
    m_file.reset();
}

void FileLogger::Write(const CString& text) {
    if (m_file != nullptr) {
        m_file->write({text.GetString(), static_cast<std::size_t>(text.GetLength())});
    }
}

}  // namespace vex_util

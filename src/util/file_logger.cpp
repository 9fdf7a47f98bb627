#include "basalt/util/file_logger.h"

#include "src/platform/text_file.h"

namespace vex_util {

FileLogger::FileLogger() : FileLogger(nullptr) {}

FileLogger::FileLogger(const char* path) {
    Open(path);
}

FileLogger::~FileLogger() {
    Close();
}

void FileLogger::Open(const char* path) {
    Close();
    if (path != nullptr && *path != '\0') {
        fopen_s(&m_stream, path, "w");
    }
}

void FileLogger::Close() {
    if (m_stream != nullptr) {
        std::fclose(m_stream);
        m_stream = nullptr;
    }
}

void FileLogger::Write(const CString& text) {
    if (m_stream != nullptr) {
        basalt::platform::write_text(text.GetString(), m_stream);
    }
}

}  // namespace vex_util

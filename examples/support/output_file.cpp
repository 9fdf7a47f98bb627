#include "output_file.h"

#include <unistd.h>

#include <cerrno>
#include <filesystem>
#include <system_error>
#include <utility>

#include "input_error.h"
#include "program.h"

OutputFile::OutputFile(std::string path) : m_path(std::move(path)) {
    std::error_code unknown;
    m_is_new = !std::filesystem::exists(std::filesystem::symlink_status(m_path, unknown));
    m_file = std::fopen(m_path.c_str(), "ab");
    if (m_file == nullptr) {
        fail_to_write(m_path);
    }
}

OutputFile::~OutputFile() {
    if (m_file == nullptr) {
        return;
    }
    std::fclose(m_file);
    if (m_is_new) {
        std::error_code refused;
        std::filesystem::remove(m_path, refused);
    }
}

void OutputFile::write(const std::string& text) {
    // Devices and pipes have no length to truncate.
    if (ftruncate(fileno(m_file), 0) != 0 && errno != EINVAL) {
        fail_to_write(m_path);
    }
    m_is_new = false;
    write_all(m_file, text, m_path);
    if (std::fclose(std::exchange(m_file, nullptr)) != 0) {
        fail_to_write(m_path);
    }
}

void spare_inputs(const char* option, const std::string& path, const std::vector<std::string>& inputs) {
    for (const std::string& input : inputs) {
        std::error_code no_such_file;
        if (std::filesystem::equivalent(path, input, no_such_file)) {
            throw InputError(std::string(option) + " would overwrite " + input);
        }
    }
}

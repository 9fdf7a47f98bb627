#include "program.h"

#include <basalt/version.h>

#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <exception>
#include <filesystem>
#include <new>
#include <stdexcept>
#include <system_error>
#include <utility>
#include <vector>

#include "input_error.h"

namespace {

enum ExitCode { SUCCESS = 0, FAILURE = 1, BAD_INPUT = 2 };

/// A full disk shows only when the buffer is flushed.
void write_all(std::FILE* file, const std::string& text, const std::string& name) {
    if (std::fwrite(text.data(), 1, text.size(), file) != text.size() || std::fflush(file) != 0) {
        throw std::runtime_error("cannot write to " + name + ": " + std::generic_category().message(errno));
    }
}

std::string text_of(const Program& program, const CommandLine& line) {
    if (line.help) {
        return program.syntax.usage;
    }
    return line.version ? std::string(program.name) + " " BASALT_VERSION "\n" : program.run(line);
}

}  // namespace

int exit_status_of(const std::string& name, const std::function<int()>& work) {
    const auto complain = [&name](const char* message, ExitCode code) {
        std::fprintf(stderr, "%s: %s\n", name.c_str(), message);
        return code;
    };
    try {
        return work();
    } catch (const InputError& error) {
        return complain(error.what(), BAD_INPUT);
    } catch (const std::bad_alloc&) {
        return complain("out of memory", FAILURE);
    } catch (const std::exception& error) {
        return complain(error.what(), FAILURE);
    }
}

int run_program(const Program& program, int count, char** arguments) {
    return exit_status_of(program.name, [&] {
        const std::vector<std::string> words(arguments + (count > 0 ? 1 : 0), arguments + count);
        print(text_of(program, parse_command_line(words, program.syntax)));
        return SUCCESS;
    });
}

void print(const std::string& text) {
    write_all(stdout, text, "standard output");
}

OutputFile::OutputFile(std::string path) : m_path(std::move(path)) {
    std::error_code unknown;
    m_is_new = !std::filesystem::exists(std::filesystem::symlink_status(m_path, unknown));
    m_file = std::fopen(m_path.c_str(), "ab");
    if (m_file == nullptr) {
        fail();
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
    std::FILE* const file = std::exchange(m_file, nullptr);
    try {
        // Devices and pipes have no length to truncate.
        if (ftruncate(fileno(file), 0) != 0 && errno != EINVAL) {
            fail();
        }
        write_all(file, text, m_path);
    } catch (...) {
        std::fclose(file);
        throw;
    }
    if (std::fclose(file) != 0) {
        fail();
    }
}

void OutputFile::fail() const {
    throw std::runtime_error("cannot write to " + m_path + ": " + std::generic_category().message(errno));
}

void write_file(const std::string& path, const std::string& text) {
    OutputFile(path).write(text);
}

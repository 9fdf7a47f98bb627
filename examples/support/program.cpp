#include "program.h"

#include <cerrno>
#include <cstdio>
#include <exception>
#include <new>
#include <stdexcept>
#include <system_error>

#include "input_error.h"

namespace {

enum ExitCode { SUCCESS = 0, FAILURE = 1, BAD_INPUT = 2 };

/// A full disk shows only when the buffer is flushed.
void write_all(std::FILE* file, const std::string& text, const std::string& name) {
    if (std::fwrite(text.data(), 1, text.size(), file) != text.size() || std::fflush(file) != 0) {
        throw std::runtime_error("cannot write to " + name + ": " + std::generic_category().message(errno));
    }
}

}  // namespace

int run_program(const char* name, Command command, int count, char** arguments) {
    const auto complain = [name](const char* message, ExitCode code) {
        std::fprintf(stderr, "%s: %s\n", name, message);
        return code;
    };
    try {
        const std::string text =
            command(std::vector<std::string>(arguments + (count > 0 ? 1 : 0), arguments + count));
        write_all(stdout, text, "standard output");
        return SUCCESS;
    } catch (const InputError& error) {
        return complain(error.what(), BAD_INPUT);
    } catch (const std::bad_alloc&) {
        return complain("out of memory", FAILURE);
    } catch (const std::exception& error) {
        return complain(error.what(), FAILURE);
    }
}

void write_file(const std::string& path, const std::string& text) {
    std::FILE* file = std::fopen(path.c_str(), "wb");
    if (file == nullptr) {
        throw std::runtime_error("cannot write to " + path + ": " + std::generic_category().message(errno));
    }
    try {
        write_all(file, text, path);
    } catch (...) {
        std::fclose(file);
        throw;
    }
    if (std::fclose(file) != 0) {
        throw std::runtime_error("cannot write to " + path + ": " + std::generic_category().message(errno));
    }
}

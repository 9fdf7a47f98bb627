#include "program.h"

#include <basalt/version.h>

#include <cerrno>
#include <cstdio>
#include <exception>
#include <new>
#include <stdexcept>
#include <system_error>
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

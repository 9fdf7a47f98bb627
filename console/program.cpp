#include "program.h"

#include <cerrno>
#include <exception>
#include <new>
#include <stdexcept>
#include <system_error>

#include "input_error.h"

int exit_status_of(const std::string& name, const std::function<int()>& work) {
    const auto report = [&name](const char* message, int code) {
        std::fprintf(stderr, "%s: %s\n", name.c_str(), message);
        return code;
    };
    try {
        return work();
    } catch (const InputError& error) {
        return report(error.what(), 2);
    } catch (const std::bad_alloc&) {
        return report("out of memory", 1);
    } catch (const std::exception& error) {
        return report(error.what(), 1);
    }
}

void print(const std::string& text) {
    write_all(stdout, text, "standard output");
}

void write_all(std::FILE* file, const std::string& text, const std::string& name) {
    // A full disk shows only when the buffer is flushed.
    if (std::fwrite(text.data(), 1, text.size(), file) != text.size() || std::fflush(file) != 0) {
        fail_to_write(name);
    }
}

void fail_to_write(const std::string& name) {
    throw std::runtime_error("cannot write to " + name + ": " + std::generic_category().message(errno));
}

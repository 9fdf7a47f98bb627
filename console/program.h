// Start and end of every command-line program here: one line for an error, an exit status, and a
// check that the output was written.
#ifndef CONSOLE_PROGRAM_H
#define CONSOLE_PROGRAM_H

#include <cstdio>
#include <functional>
#include <string>

#include "command_line.h"

struct Program {
    const char* name;
    const Syntax& syntax;
    std::string (*run)(const CommandLine& line);  ///< makes the text for standard output
};

/// Runs a program and prints its text, its usage or its version. Exit status: 0 success, 1 when the text
/// cannot be written or anything else failed, 2 for an InputError; an error is one line `name: message` on
/// standard error.
int run_program(const Program& program, int count, char** arguments);

/// Runs a program that writes its output itself, and handles its exceptions as run_program()
/// does.
int exit_status_of(const std::string& name, const std::function<int()>& work);

/// Prints a text whole. std::runtime_error, with the system's reason, when that fails.
void print(const std::string& text);

/// A file that is opened before the work and written when it is done, so that a file that cannot be written
/// is reported at once. Failures are std::runtime_error with the file and the system's reason.
class OutputFile {
public:
    /// The file's contents stay until write().
    explicit OutputFile(std::string path);
    /// Removes a file created here if write() was not called.
    ~OutputFile();
    OutputFile(const OutputFile&) = delete;
    OutputFile& operator=(const OutputFile&) = delete;

    /// Replaces what the file holds. Called once.
    void write(const std::string& text);

private:
    [[noreturn]] void fail() const;

    std::string m_path;
    bool m_is_new;
    std::FILE* m_file;  ///< null once it is written
};

/// Writes a file whole. std::runtime_error, naming it and the system's reason, when that fails.
void write_file(const std::string& path, const std::string& text);

#endif

// Start and end of every command-line program here: one line for an error, an exit status, and a
// check that the output was written.
#ifndef CONSOLE_PROGRAM_H
#define CONSOLE_PROGRAM_H

#include <cstdio>
#include <functional>
#include <string>

/// Runs a program's work and reports its exceptions. Exit status: that of the work, 2 for an InputError, 1
/// for any other; an error is one line `name: message` on standard error.
int exit_status_of(const std::string& name, const std::function<int()>& work);

/// Prints a text whole. std::runtime_error, with the system's reason, when that fails.
void print(const std::string& text);

/// Writes a text and flushes the file. std::runtime_error as fail_to_write().
void write_all(std::FILE* file, const std::string& text, const std::string& name);

/// Throws std::runtime_error with the file's name and errno's reason.
[[noreturn]] void fail_to_write(const std::string& name);

#endif

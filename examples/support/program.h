// What every command-line program here does at its two ends: one line for an error, an exit status, and a
// report that is not lost on a full disk.
#ifndef EXAMPLES_PROGRAM_H
#define EXAMPLES_PROGRAM_H

#include <string>
#include <vector>

/// Makes the text for standard output from the arguments that follow the program's name.
using Command = std::string (*)(const std::vector<std::string>& arguments);

/// Runs a command and prints its text. Exit status: 0 success, 1 when the text cannot be written or anything
/// else failed, 2 for an InputError; an error is one line `name: message` on standard error.
int run_program(const char* name, Command command, int count, char** arguments);

/// Writes a file whole. std::runtime_error, naming it and the system's reason, when that fails.
void write_file(const std::string& path, const std::string& text);

#endif

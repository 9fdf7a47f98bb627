// Bad input, reported in one line with its position.
#ifndef CONSOLE_INPUT_ERROR_H
#define CONSOLE_INPUT_ERROR_H

#include <cstddef>
#include <stdexcept>
#include <string>

/// Unusable user input. The text is one line without the program's name.
class InputError : public std::runtime_error {
public:
    explicit InputError(const std::string& message) : std::runtime_error(message) {}
    /// `file: message`
    InputError(const std::string& file, const std::string& message) : InputError(file + ": " + message) {}
    /// `file:line: message`; lines count from 1.
    InputError(const std::string& file, std::size_t line, const std::string& message)
        : InputError(file + ":" + std::to_string(line) + ": " + message) {}
    /// `file:line:column: message`; columns count bytes from 1.
    InputError(const std::string& file, std::size_t line, std::size_t column, const std::string& message)
        : InputError(file + ":" + std::to_string(line) + ":" + std::to_string(column) + ": " + message) {}
};

#endif

// A file for a program's results.
#ifndef EXAMPLES_OUTPUT_FILE_H
#define EXAMPLES_OUTPUT_FILE_H

#include <cstdio>
#include <string>
#include <vector>

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
    std::string m_path;
    bool m_is_new;
    std::FILE* m_file;  ///< null once it is written
};

/// InputError when an option's file is one of the inputs, by whatever name.
void spare_inputs(const char* option, const std::string& path, const std::vector<std::string>& inputs);

#endif

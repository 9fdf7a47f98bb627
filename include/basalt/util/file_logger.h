/// @file
/// The simplest text log: one file, and the texts as they come.
#ifndef BASALT_UTIL_FILE_LOGGER_H
#define BASALT_UTIL_FILE_LOGGER_H

#include <memory>

#include "basalt/export.h"
#include "basalt/platform/cstring.h"

namespace basalt::platform {
class TextFile;
}

namespace vex_util {

/// A log file. It holds the texts written to it and nothing else: no time stamps, levels or line ends; the
/// host formats every line.
///
/// Texts are buffered and reach the file when the buffer of 8 KiB is full, at Close(), at destruction, and,
/// of a log that is still open, when the process returns from main or exits; one that is killed or aborts
/// loses its last ones. A forked child sends what a log holds, its parent's texts among it, only where it has
/// written to that log itself. The buffer goes out between two texts, so whatever else happens to
/// the process, and whoever else appends to the file, each text shorter than the buffer is in it whole or not
/// at all.
///
/// Failures are silent: what cannot be opened stays closed, and what cannot be written, on a full disk or
/// beyond the limit on file sizes, is lost; the text in which the room ends is cut there.
/// Threads: Write() from any number of threads, each text whole; Open() and Close() from one alone.
class BASALT_API FileLogger {
public:
    /// A closed log.
    FileLogger();
    /// A log opened as by Open().
    FileLogger(const char* path);
    /// Closes the log.
    ~FileLogger();

    /// The file has one owner: copies are refused.
    FileLogger(const FileLogger&) = delete;
    FileLogger& operator=(const FileLogger&) = delete;

    /// Closes the log, then opens a file, created or emptied.
    /// @param path in the active code page, either separator; bytes that are no character of it are kept.
    /// Null, empty or a file that cannot be opened, such as a pipe that nobody reads, leaves the log closed
    void Open(const char* path);
    /// Writes what is buffered and closes the file; nothing when the log is closed.
    void Close();
    /// Appends a text up to its first zero, in the active code page: `?` for characters that it lacks, and
    /// carriage return with line feed for every line feed, a preceding carriage return or not. Nothing when
    /// the log is closed. Takes no memory.
    void Write(const CString& text);

private:
    std::unique_ptr<basalt::platform::TextFile> m_file;  // null when the log is closed
};

}  // namespace vex_util

#endif

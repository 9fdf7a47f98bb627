/// @file
/// A plain text log: one file, and the texts written to it.
#ifndef BASALT_UTIL_FILE_LOGGER_H
#define BASALT_UTIL_FILE_LOGGER_H

#include <memory>
#include <utility>

#include "basalt/export.h"
#include "basalt/platform/cstring.h"

namespace basalt::platform {
class TextFile;
}

namespace vex_util {

/// A log file. It holds the texts written to it and nothing else: no time stamps, levels or line ends; the
/// host formats every line.
///
/// Texts are buffered and reach the file when the buffer of 8 KiB is full, at Close(), at destruction and, if
/// the log is still open, when the process returns from main or exits; a process that is killed or aborts
/// loses the last ones. A forked child flushes a log, its parent's texts included, only if it has written to
/// it itself. The buffer is flushed between two texts, so each text shorter than the buffer is in the file
/// whole or not at all, even if the process is killed or others append to the file.
///
/// Failures are silent: a file that cannot be opened leaves the log closed; what cannot be written, on a full
/// disk, beyond the limit on file sizes or into a full or broken pipe, is lost, and the text there is
/// truncated. No call raises a signal or blocks. Threads: Write() from any number of threads, each text
/// whole; everything else from one thread at a time.
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
    /// Takes over another's file; that log is closed afterwards.
    FileLogger(FileLogger&& other) noexcept : FileLogger() { m_file.swap(other.m_file); }
    /// Closes the log and takes over another's file; that log is closed afterwards.
    FileLogger& operator=(FileLogger&& other) noexcept {
        FileLogger taken(std::move(other));
        m_file.swap(taken.m_file);
        return *this;
    }

    /// Closes the log, then opens a file, created or emptied.
    /// @param path in the active code page, either separator; bytes invalid in it pass through unchanged.
    /// Null, empty or a file that cannot be opened, such as a pipe without a reader, leaves the log closed
    void Open(const char* path);
    /// Flushes the buffer and closes the file; nothing if the log is closed.
    void Close();
    /// Appends a text up to its first zero, in the active code page: `?` for characters that it lacks, and
    /// carriage return with line feed for every line feed, after a carriage return too. Nothing if the log is
    /// closed. Allocates no memory.
    void Write(const CString& text);

private:
    std::unique_ptr<basalt::platform::TextFile> m_file;  // null when the log is closed
};

}  // namespace vex_util

#endif

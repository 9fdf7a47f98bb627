// Text files written through the C library's buffered streams.
#ifndef BASALT_SRC_PLATFORM_TEXT_FILE_H
#define BASALT_SRC_PLATFORM_TEXT_FILE_H

#include <cstdio>
#include <string_view>

// Opens a file for writing: created, or emptied when it exists. What is written goes to the file's end as it
// then is, so two streams on one file do not overwrite each other. A child process does not inherit it.
// The path is narrow text in the active code page, either separator; a path with bytes that are no
// character of it goes to the system as it is. The mode is "w", the only one there is.
// Failure: an errno value (EINVAL for a null argument or another mode) and a null stream; 0 is success.
// Threads: reentrant.
int fopen_s(std::FILE** stream, const char* path, const char* mode);

namespace basalt::platform {

// Writes text to a byte stream as text mode does: in the active code page, '?' for what that lacks, CR LF for
// each LF. Nothing is added and the stream is not flushed, except that a text for which the buffer has no
// room left sends the buffer out first: what reaches the file ends between two texts, unless one is longer
// than the buffer. Takes no memory. Errors are the stream's.
// Threads: thread-safe; each text is whole.
void write_text(std::wstring_view text, std::FILE* stream);

}  // namespace basalt::platform

#endif

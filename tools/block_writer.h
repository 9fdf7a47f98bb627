// Standard output, by blocks.
#ifndef TOOLS_BLOCK_WRITER_H
#define TOOLS_BLOCK_WRITER_H

#include <string>

/// Collects text and writes it in blocks. std::runtime_error, with the system's reason, when
/// something cannot be written: a full disk or a closed pipe loses nothing silently.
class BlockWriter {
public:
    /// The output buffer: append to it, then call end_of_line().
    std::string& text() { return m_text; }
    void end_of_line();
    /// Flushes the buffer.
    void flush();
    /// Flushes and closes the output; some file systems report a full disk only here.
    void finish();

private:
    std::string m_text;
    bool m_wrote = false;
};

#endif

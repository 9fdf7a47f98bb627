// Standard output, by blocks.
#ifndef TOOLS_BLOCK_WRITER_H
#define TOOLS_BLOCK_WRITER_H

#include <string>

/// Collects text and writes it when there is enough. std::runtime_error, with the system's reason, when
/// something cannot be written: a full disk or a closed pipe loses nothing silently.
class BlockWriter {
public:
    /// What is to be written: append to it, then call end_of_line().
    std::string& text() { return m_text; }
    void end_of_line();
    /// Writes all that is there.
    void flush();
    /// Writes the rest and closes the output, at which some file systems first say that they are full.
    void finish();

private:
    std::string m_text;
    bool m_wrote = false;
};

#endif

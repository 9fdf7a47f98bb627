#include "filter.h"

#include <cstdio>
#include <string>
#include <string_view>

#include "block_writer.h"
#include "input_error.h"
#include "line_reader.h"

namespace {

/// Blank, or a comment.
bool is_copied(std::string_view line) {
    const std::size_t first = line.find_first_not_of(" \t");
    return first == std::string_view::npos || line[first] == '#';
}

class Run {
public:
    Run(const Command& command, const CommandLine& line)
        : m_command(command),
          m_format(format_of(command, line)),
          m_filter(command.make(line, m_format)),
          m_reader([this] { m_writer.flush(); }) {}

    int all() {
        while (m_reader.next()) {
            const std::size_t kept = m_writer.text().size();
            try {
                one();
                m_writer.end_of_line();
            } catch (const InputError& error) {
                m_writer.text().resize(kept);
                refuse(error.what());
            }
        }
        m_writer.finish();
        return m_refused ? 1 : 0;
    }

private:
    void one() {
        if (m_reader.too_long()) {
            throw InputError("the line is longer than " + std::to_string(LineReader::LONGEST) + " bytes");
        }
        std::string_view line = m_reader.line();
        std::string& text = m_writer.text();
        if (m_command.lines == Lines::MARKED) {
            if (m_reader.number() == 1 && line.substr(0, 3) == "\xEF\xBB\xBF") {
                line.remove_prefix(3);
            }
            if (is_copied(line)) {
                text += line;
                return;
            }
        }
        Fields fields(line, m_format);
        Row row(text, m_format);
        if (m_format.keep && m_command.lines == Lines::WHOLE) {
            row.any_text(line);
        } else if (m_format.keep) {
            row.text(line);
        }
        m_filter(fields, row);
        if (!fields.ended() && !m_format.keep) {
            row.text(fields.rest());
        }
    }

    void refuse(const char* why) {
        m_refused = true;
        // One write, so that lines of several programs do not mix.
        std::string message = "basalt ";
        message.append(m_command.name).append(": line ").append(std::to_string(m_reader.number()));
        message.append(": ").append(why).append("\n");
        std::fputs(message.c_str(), stderr);
    }

    const Command& m_command;
    Format m_format;
    Filter m_filter;
    BlockWriter m_writer;
    LineReader m_reader;
    bool m_refused = false;
};

}  // namespace

int run_filter(const Command& command, const CommandLine& line) {
    return Run(command, line).all();
}

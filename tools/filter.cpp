#include "filter.h"

#include <cstddef>
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

/// Of many bad lines, as where a whole file has another format, these are reported one by one.
constexpr std::size_t MOST_REPORTED = 20;

class FilterRun {
public:
    FilterRun(const Command& command, const CommandLine& line)
        : m_command(command), m_format(format_of(command, line)), m_work(command.make(line, m_format)) {}

    int run(const std::vector<std::string>& files) {
        for (const std::string& path : files) {
            LineReader reader(path, [this] { m_writer.flush(); });
            while (reader.next()) {
                const std::size_t kept = m_writer.text().size();
                try {
                    if (m_work.end ? collect(reader) : convert(reader)) {
                        m_writer.end_of_line();
                    }
                } catch (const InputError& error) {
                    m_writer.text().resize(kept);
                    refuse(path, reader.number(), error.what());
                }
            }
            end_group();
        }
        m_writer.finish();
        if (m_refused > MOST_REPORTED) {
            report(std::to_string(m_refused) + " lines were skipped, of which the first " +
                   std::to_string(MOST_REPORTED) + " are listed");
        }
        return m_refused > 0 ? 1 : 0;
    }

private:
    std::string_view line_of(const LineReader& reader) const {
        if (reader.too_long()) {
            throw InputError("the line is longer than " + std::to_string(LineReader::LONGEST) + " bytes");
        }
        std::string_view line = reader.line();
        if (m_command.lines == Lines::WITH_COMMENTS && reader.number() == 1 &&
            line.substr(0, 3) == "\xEF\xBB\xBF") {
            line.remove_prefix(3);
        }
        return line;
    }

    /// Whether a line of output was made.
    bool collect(const LineReader& reader) {
        const std::string_view line = line_of(reader);
        if (is_copied(line)) {
            return line.find('#') == std::string_view::npos && end_of_group();
        }
        Fields fields(line, m_format);
        Row nothing(m_writer.text(), m_format);
        m_work.line(fields, nothing);
        return false;
    }

    bool end_of_group() {
        Row row(m_writer.text(), m_format);
        return m_work.end(row);
    }

    void end_group() {
        if (m_work.end && end_of_group()) {
            m_writer.end_of_line();
        }
    }

    bool convert(const LineReader& reader) {
        const std::string_view line = line_of(reader);
        std::string& text = m_writer.text();
        if (m_command.lines == Lines::WITH_COMMENTS && is_copied(line)) {
            text += line;
            return true;
        }
        Fields fields(line, m_format);
        Row row(text, m_format);
        if (m_format.keep && m_command.lines == Lines::ONE_FIELD) {
            row.any_text(line);
        } else if (m_format.keep) {
            row.text(line);
        }
        m_work.line(fields, row);
        if (!fields.ended() && !m_format.keep) {
            row.text(fields.rest());
        }
        return true;
    }

    void refuse(const std::string& path, std::size_t number, const std::string& why) {
        if (++m_refused <= MOST_REPORTED) {
            report((path == "-" ? "" : path + ": ") + "line " + std::to_string(number) + ": " + why);
        }
    }

    /// One write, so that lines of several programs do not mix.
    void report(const std::string& message) const {
        std::fputs(("basalt " + std::string(m_command.name) + ": " + message + "\n").c_str(), stderr);
    }

    const Command& m_command;
    Format m_format;
    Work m_work;
    BlockWriter m_writer;
    std::size_t m_refused = 0;
};

}  // namespace

int run_filter(const Command& command, const CommandLine& line, const std::vector<std::string>& files) {
    return FilterRun(command, line).run(files.empty() ? std::vector<std::string>{"-"} : files);
}

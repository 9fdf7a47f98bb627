#include "command_line.h"

#include <algorithm>

#include "input_error.h"
#include "number_parsing.h"

namespace {

class Parser {
public:
    Parser(const std::vector<std::string>& arguments, const Syntax& syntax)
        : m_arguments(arguments), m_syntax(syntax) {}

    CommandLine parse() {
        bool only_operands = false;
        for (; m_at < m_arguments.size() && !m_line.help && !m_line.version; ++m_at) {
            const std::string& argument = m_arguments[m_at];
            if (only_operands || is_operand(argument)) {
                m_line.operands.push_back(argument);
            } else if (argument == "--") {
                only_operands = true;
            } else if (argument == "--help" || argument == "-h") {
                m_line.help = true;
            } else if (argument == "--version") {
                m_line.version = true;
            } else if (is_one_of(m_syntax.flags, argument)) {
                m_line.flags.push_back(argument);
            } else {
                take_option(argument);
            }
        }
        return std::move(m_line);
    }

private:
    static bool is_operand(const std::string& argument) {
        return argument.size() < 2 || argument[0] != '-' || argument[1] == '.' ||
               (argument[1] >= '0' && argument[1] <= '9');
    }

    static bool is_one_of(const std::vector<std::string_view>& names, std::string_view name) {
        return std::find(names.begin(), names.end(), name) != names.end();
    }

    void take_option(const std::string& argument) {
        const std::size_t equals = argument.find('=');
        const std::string name = argument.substr(0, equals);
        if (!is_one_of(m_syntax.names, name)) {
            throw InputError(is_one_of(m_syntax.flags, name)
                                 ? "option " + name + " takes no value"
                                 : "unknown option " + quoted(argument) + " (--help lists them)");
        }
        if (std::any_of(m_line.options.begin(), m_line.options.end(),
                        [&](const auto& given) { return given.first == name; })) {
            throw InputError("option " + name + " is given twice");
        }
        if (equals == std::string::npos && m_at + 1 == m_arguments.size()) {
            throw InputError("option " + name + " needs a value");
        }
        m_line.options.emplace_back(
            name, equals != std::string::npos ? argument.substr(equals + 1) : m_arguments[++m_at]);
    }

    const std::vector<std::string>& m_arguments;
    const Syntax& m_syntax;
    std::size_t m_at = 0;
    CommandLine m_line;
};

}  // namespace

CommandLine parse_command_line(const std::vector<std::string>& arguments, const Syntax& syntax) {
    return Parser(arguments, syntax).parse();
}

std::string Columns::text() const {
    std::size_t width = 0;
    for (const auto& [name, text] : m_lines) {
        width = std::max(width, name.size());
    }
    std::string all;
    for (const auto& [name, text] : m_lines) {
        all.append("  ").append(name).append(width - name.size() + 2, ' ');
        for (const char c : text) {
            all.append(1, c).append(c == '\n' ? width + 4 : 0, ' ');
        }
        all += '\n';
    }
    return all;
}

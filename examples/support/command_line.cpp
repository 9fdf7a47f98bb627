#include "command_line.h"

#include <algorithm>

#include "input_error.h"
#include "number_parsing.h"

namespace {

class Parser {
public:
    Parser(const std::vector<std::string>& arguments, const std::vector<std::string_view>& names,
           const std::string& what)
        : m_arguments(arguments), m_names(names), m_what(what) {}

    CommandLine parse() {
        bool only_files = false;
        for (; m_at < m_arguments.size() && !m_line.help && !m_line.version; ++m_at) {
            const std::string& argument = m_arguments[m_at];
            if (only_files || argument.size() < 2 || argument[0] != '-') {
                take_file(argument);
            } else if (argument == "--") {
                only_files = true;
            } else if (argument == "--help") {
                m_line.help = true;
            } else if (argument == "--version") {
                m_line.version = true;
            } else {
                take_option(argument);
            }
        }
        return std::move(m_line);
    }

private:
    void take_file(const std::string& name) {
        if (name.empty()) {
            throw InputError("the " + m_what + "'s name is empty");
        }
        if (!m_line.file.empty()) {
            throw InputError("one " + m_what + " only, but " + quoted(name) + " is a second one");
        }
        m_line.file = name;
    }

    void take_option(const std::string& argument) {
        const std::size_t equals = argument.find('=');
        const std::string name = argument.substr(0, equals);
        if (std::find(m_names.begin(), m_names.end(), name) == m_names.end()) {
            throw InputError("unknown option " + quoted(argument) + " (--help lists them)");
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
    const std::vector<std::string_view>& m_names;
    const std::string& m_what;
    std::size_t m_at = 0;
    CommandLine m_line;
};

}  // namespace

CommandLine parse_command_line(const std::vector<std::string>& arguments,
                               const std::vector<std::string_view>& names, const std::string& what) {
    return Parser(arguments, names, what).parse();
}

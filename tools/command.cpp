#include "command.h"

#include <algorithm>
#include <cstdint>
#include <optional>

#include "input_error.h"
#include "number_parsing.h"

bool has_flag(const CommandLine& line, const Option& option) {
    return std::find(line.flags.begin(), line.flags.end(), option.name) != line.flags.end();
}

const std::string* value_of(const CommandLine& line, const Option& option) {
    const auto given = std::find_if(line.options.begin(), line.options.end(),
                                    [&](const auto& pair) { return pair.first == option.name; });
    return given != line.options.end() ? &given->second : nullptr;
}

void check_operands(const Command& command, const CommandLine& line) {
    std::size_t count = 0;
    std::string_view words = command.operands;
    while (!words.empty()) {
        const std::size_t end = std::min(words.find(' '), words.size());
        if (count == line.operands.size()) {
            throw InputError(std::string(words.substr(0, end)) + " is missing (--help shows what is taken)");
        }
        ++count;
        words.remove_prefix(std::min(end + 1, words.size()));
    }
    if (line.operands.size() > count) {
        throw InputError("unexpected argument " + quoted(line.operands[count]) +
                         " (--help shows what is taken)");
    }
}

Format format_of(const Command& command, const CommandLine& line) {
    Format format;
    format.csv = has_flag(line, CSV);
    format.separator = format.csv ? ',' : command.separator;
    format.degrees = has_flag(line, DEGREES);
    format.keep = has_flag(line, KEEP);
    if (const std::string* text = value_of(line, PRECISION)) {
        const std::optional<std::int64_t> digits = parse_integer(*text);
        if (!digits || *digits < 0 || *digits > Format::MOST_DIGITS) {
            throw InputError("--precision takes a whole number from 0 to " +
                             std::to_string(Format::MOST_DIGITS) + ", not " + quoted(*text));
        }
        format.precision = static_cast<int>(*digits);
    }
    return format;
}

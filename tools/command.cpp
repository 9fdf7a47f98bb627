#include "command.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
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

std::vector<std::string> take_files(const Command& command, CommandLine& line) {
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
    const auto files = line.operands.begin() + static_cast<std::ptrdiff_t>(count);
    std::vector<std::string> taken(files, line.operands.end());
    line.operands.erase(files, line.operands.end());
    return taken;
}

namespace {

bool takes(const Command& command, const Option& option) {
    return std::any_of(command.options.begin(), command.options.end(),
                       [&](const Option& known) { return std::string_view(known.name) == option.name; });
}

/// The unit of angles: an option, or the environment's choice where the command has angles.
bool degrees_of(const Command& command, const CommandLine& line) {
    if (has_flag(line, DEGREES) && has_flag(line, RADIANS)) {
        throw InputError("--degrees and --radians exclude each other");
    }
    if (!takes(command, DEGREES) || has_flag(line, DEGREES) || has_flag(line, RADIANS)) {
        return has_flag(line, DEGREES);
    }
    const char* text = std::getenv("BASALT_ANGLES");
    const std::string_view unit = text != nullptr ? text : "";
    if (!unit.empty() && unit != "degrees" && unit != "radians") {
        throw InputError("BASALT_ANGLES is degrees or radians, not " + quoted(unit));
    }
    return unit == "degrees";
}

}  // namespace

Format format_of(const Command& command, const CommandLine& line) {
    Format format;
    format.csv = has_flag(line, CSV);
    format.separator = format.csv ? ',' : command.separator;
    format.degrees = degrees_of(command, line);
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

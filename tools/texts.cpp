// Hexadecimal text, and paths. Every line is text here, comments included.
#include <basalt/files.h>
#include <basalt/util.h>

#include <algorithm>

#include "commands.h"
#include "input_error.h"

namespace {

Work make_hex(const CommandLine&, const Format&) {
    return [](Fields& fields, Row& row) {
        row.text(basalt::StringToHexString(std::string(fields.whole_line())));
    };
}

Work make_unhex(const CommandLine&, const Format&) {
    return [](Fields& fields, Row& row) {
        const std::string digits(fields.whole_line());
        if (!basalt::IsHexString(digits)) {
            throw InputError("expected hexadecimal digits only");
        }
        if (digits.size() % 2 != 0) {
            throw InputError("expected two digits for each byte, but the last has one");
        }
        const std::vector<unsigned char> bytes = basalt::HexStringToVector(digits);
        if (std::find(bytes.begin(), bytes.end(), '\n') != bytes.end()) {
            throw InputError("the bytes are more than one line");
        }
        row.text(std::string(bytes.begin(), bytes.end()));
    };
}

/// A path of bytes, each widened to the character of that number: the separators are ASCII, so the encoding
/// does not matter.
CString widened(std::string_view path) {
    std::wstring text;
    for (const char c : path) {
        text += static_cast<wchar_t>(static_cast<unsigned char>(c));
    }
    return {text.data(), static_cast<int>(text.size())};
}

std::string narrowed(const CString& text) {
    std::string bytes;
    for (int i = 0; i < text.GetLength(); ++i) {
        bytes += static_cast<char>(text[i]);
    }
    return bytes;
}

Work make_path(const CommandLine&, const Format&) {
    return [](Fields& fields, Row& row) {
        const std::string_view given = fields.whole_line();
        if (given.find('\0') != std::string_view::npos) {
            throw InputError("a path holds no zero byte");
        }
        const vex_util::Path path(widened(given));
        constexpr unsigned char ALL = 15;
        if (path.GetPath(ALL).IsEmpty() && !given.empty()) {
            throw InputError("a part of the path is longer than 255 bytes");
        }
        for (const int part : {1, 2, 4, 8}) {
            row.any_text(narrowed(path.GetPath(static_cast<unsigned char>(part))));
        }
    };
}

}  // namespace

const Command HEX = {
    "hex",
    "",
    "a line as hexadecimal digits",
    "Reads any line, zero bytes included. Writes two digits for each byte, 0 to 9 and a to f. The line's\n"
    "end, LF or CRLF, is no part of it.",
    {},
    {{"echo 'P1 ok' | basalt hex", "5031206f6b"}},
    make_hex,
    Lines::ONE_FIELD};

const Command UNHEX = {
    "unhex",
    "",
    "the line that hexadecimal digits stand for",
    "Reads two digits for each byte, in either case. Writes the bytes as they are. A line that would hold\n"
    "the byte 0a, and so be two, is refused.",
    {},
    {{"echo '5031206F6B' | basalt unhex", "P1 ok"}},
    make_unhex,
    Lines::ONE_FIELD};

const Command PATH = {
    "path",
    "",
    "a path taken apart",
    "Reads a path, split at / and \\ alike. Writes DRIVE DIRECTORY NAME EXTENSION with a tab between them,\n"
    "or a comma with --csv, which puts what holds one in quotes, the line of --keep too. Joined they are\n"
    "the path. The disk is not read.",
    {CSV, KEEP},
    {{"echo '/data/job.tar.gz' | basalt path --csv", ",/data/,job.tar,.gz"}},
    make_path,
    Lines::ONE_FIELD,
    '\t'};

#include "report.h"

#include <basalt/frame.h>
#include <basalt/util.h>

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <stdexcept>

namespace {

/// Replaces control characters, which would break the line.
CString one_line(CString text) {
    for (int i = 0; i < text.GetLength(); ++i) {
        if (text[i] < L' ' || text[i] == L'\x7F') {
            text.SetAt(i, L'?');
        }
    }
    return text;
}

void append_unit(CString& json, unsigned unit) {
    json.AppendFormat(L"\\u%04x", unit);
}

/// A string literal. What is no character, as in a name that is not UTF-8, becomes U+FFFD.
CString literal(const CString& text) {
    CString json = L"\"";
    for (int i = 0; i < text.GetLength(); ++i) {
        auto ch = static_cast<unsigned>(text[i]);
        if ((ch >= 0xD800 && ch < 0xE000) || ch > 0x10FFFF) {
            ch = 0xFFFD;
        }
        if (ch >= 0x10000) {
            append_unit(json, 0xD7C0 + (ch >> 10));
            append_unit(json, 0xDC00 + (ch & 0x3FF));
        } else if (ch < 0x20 || ch >= 0x7F) {
            append_unit(json, ch);
        } else {
            json += ch == L'"' || ch == L'\\' ? L"\\" : L"";
            json += static_cast<wchar_t>(ch);
        }
    }
    return json + L'"';
}

CString number_text(long number) {
    CString text;
    text.Format(L"%ld", number);
    return text;
}

struct AsText {
    CString operator()(const CString& text) const { return one_line(text); }
    CString operator()(long number) const { return number_text(number); }
    CString operator()(bool yes) const { return yes ? L"yes" : L"no"; }
    CString operator()(const std::vector<CString>& texts) const {
        CString all;
        for (const CString& text : texts) {
            all += (all.IsEmpty() ? L"" : L", ") + one_line(text);
        }
        return all;
    }
};

struct AsJson {
    CString operator()(const CString& text) const { return literal(text); }
    CString operator()(long number) const { return number_text(number); }
    CString operator()(bool yes) const { return yes ? L"true" : L"false"; }
    CString operator()(const std::vector<CString>& texts) const {
        CString all = L"[";
        for (const CString& text : texts) {
            all += (all.GetLength() == 1 ? L"" : L", ") + literal(text);
        }
        return all + L"]";
    }
};

/// A device or a pipe, open for writing for as long as a log writes to it: it holds nothing to look at
/// afterwards, but poll() and write() report whether it takes text.
class Device {
public:
    explicit Device(const std::filesystem::path& path)
        : m_file(open(path.c_str(), O_WRONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC)) {}
    ~Device() {
        if (m_file >= 0) {
            close(m_file);
        }
    }
    Device(const Device&) = delete;
    Device& operator=(const Device&) = delete;

    /// A full device refuses even an empty write; a pipe without a reader was not opened.
    bool takes_text() const { return m_file >= 0 && write(m_file, "", 0) == 0; }

private:
    int m_file;
};

void log_text(const std::string& path, const CString& text) {
    vex_util::FileLogger log(path.c_str());
    log.Write(text);
}

/// Logs into a file, device or pipe. False when the text did not arrive.
bool has_logged(const std::string& path, const CString& text) {
    const std::filesystem::path file = system_path(path);
    std::error_code unknown;
    if (std::filesystem::is_other(file, unknown)) {
        const Device device(file);
        log_text(path, text);
        return device.takes_text();
    }
    log_text(path, text);
    const std::string bytes = narrow(text);
    const auto carriage_returns = static_cast<std::uintmax_t>(std::count(bytes.begin(), bytes.end(), '\n'));
    return std::filesystem::file_size(file, unknown) == bytes.size() + carriage_returns;
}

}  // namespace

CString text_report(const std::vector<Section>& sections) {
    CString text;
    for (const Section& section : sections) {
        text += CString(section.name.c_str()) + L"\n";
        for (const Fact& fact : section.facts) {
            CString line;
            line.Format(L"  %-20s", fact.name.c_str());
            line += std::visit(AsText(), fact.value);
            text += line.TrimRight() + L"\n";
        }
    }
    return text;
}

CString json_report(const std::vector<Section>& sections) {
    CString json = L"{";
    const wchar_t* section_end = L"\n";
    for (const Section& section : sections) {
        json += section_end + (L"  " + literal(section.name.c_str())) + L": {";
        const wchar_t* fact_end = L"\n";
        for (const Fact& fact : section.facts) {
            json +=
                fact_end + (L"    " + literal(fact.name.c_str())) + L": " + std::visit(AsJson(), fact.value);
            fact_end = L",\n";
        }
        json += L"\n  }";
        section_end = L",\n";
    }
    return json + L"\n}\n";
}

std::string narrow(const CString& text) {
    // In pieces, since the conversion is for short texts; they end with a line, since a combining mark may
    // belong to the letter before it.
    constexpr int PIECE = 1000;
    constexpr int LONGEST_CHARACTER = 16;
    std::string all;
    for (int start = 0; start < text.GetLength();) {
        CString piece = text.Mid(start, PIECE);
        if (const int line_end = piece.ReverseFind(L'\n'); line_end >= 0) {
            piece = piece.Left(line_end + 1);
        }
        start += piece.GetLength();
        char bytes[PIECE * LONGEST_CHARACTER + 1];
        _tchar2char(piece, bytes, PIECE * LONGEST_CHARACTER);
        all += bytes;
    }
    return all;
}

std::filesystem::path system_path(std::string path) {
    const CString text(path.c_str());
    if (text.Find(L'\xFFFD') >= 0) {
        // Bytes that are not UTF-8 pass through unchanged.
        std::replace(path.begin(), path.end(), '\\', '/');
        return path;
    }
    std::u32string name;
    for (int i = 0; i < text.GetLength(); ++i) {
        name += text[i] == L'\\' ? U'/' : static_cast<char32_t>(text[i]);
    }
    return name;
}

void write_log(const std::string& path, const CString& text) {
    // The log itself reports no errors.
    if (!has_logged(path, text)) {
        throw std::runtime_error("cannot write the log " + path);
    }
}

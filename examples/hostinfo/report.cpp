#include "report.h"

#include <basalt/frame.h>
#include <basalt/util.h>

#include <nlohmann/json.hpp>

#include <algorithm>
#include <iterator>
#include <stdexcept>

#include "input_error.h"

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

/// As UTF-8. What is no character, as in a name that is not UTF-8, becomes U+FFFD.
std::string utf8(const CString& text) {
    std::u32string characters;
    for (int i = 0; i < text.GetLength(); ++i) {
        const auto ch = static_cast<char32_t>(text[i]);
        characters += (ch >= 0xD800 && ch < 0xE000) || ch > 0x10FFFF ? U'\xFFFD' : ch;
    }
    return std::filesystem::path(characters).string();
}

struct AsText {
    CString operator()(const CString& text) const { return one_line(text); }
    CString operator()(long number) const { return std::to_string(number).c_str(); }
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
    using Json = nlohmann::ordered_json;
    Json operator()(const CString& text) const { return utf8(text); }
    Json operator()(long number) const { return number; }
    Json operator()(bool yes) const { return yes; }
    Json operator()(const std::vector<CString>& texts) const {
        Json all = Json::array();
        std::transform(texts.begin(), texts.end(), std::back_inserter(all), utf8);
        return all;
    }
};

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

std::string json_report(const std::vector<Section>& sections) {
    nlohmann::ordered_json report;
    for (const Section& section : sections) {
        for (const Fact& fact : section.facts) {
            report[section.name][fact.name] = std::visit(AsJson(), fact.value);
        }
    }
    return report.dump(2, ' ', true) + "\n";  // escaped to ASCII
}

std::string narrow(const CString& text) {
    constexpr int LONGEST_CHARACTER = 16;  // bytes
    const int size = text.GetLength() * LONGEST_CHARACTER;
    std::string bytes(static_cast<std::size_t>(size) + 1, '\0');
    _tchar2char(text, bytes.data(), size);
    return bytes.c_str();
}

std::filesystem::path system_path(std::string path) {
    std::replace(path.begin(), path.end(), '\\', '/');
    const CString text(path.c_str());
    // Bytes that are not UTF-8 pass through unchanged.
    return text.Find(L'\xFFFD') >= 0 ? path : utf8(text);
}

void write_log(const std::string& path, const CString& text) {
    const std::filesystem::path file = system_path(path);
    std::error_code unknown;
    if (std::filesystem::is_other(file, unknown)) {
        throw InputError("--log takes a file, not a device or a pipe: " + path);
    }
    {
        vex_util::FileLogger log(path.c_str());
        log.Write(text);
    }
    // The log itself reports no errors.
    const std::string bytes = narrow(text);
    const auto carriage_returns = static_cast<std::uintmax_t>(std::count(bytes.begin(), bytes.end(), '\n'));
    if (std::filesystem::file_size(file, unknown) != bytes.size() + carriage_returns) {
        throw std::runtime_error("cannot write the log " + path);
    }
}

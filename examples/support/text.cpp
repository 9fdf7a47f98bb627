#include "text.h"

#include <fmt/format.h>

#include <algorithm>
#include <cstddef>

std::string fixed_text(double value, int decimals) {
    std::string text = fmt::format("{:.{}f}", value, decimals);
    if (text[0] == '-' && text.find_first_not_of("-0.") == std::string::npos) {
        text.erase(0, 1);
    }
    return text;
}

std::string number_text(double value, int decimals) {
    std::string text = fixed_text(value, decimals);
    const std::size_t first_digit = text[0] == '-' ? 1 : 0;
    for (std::size_t i = std::min(text.find('.'), text.size()); i > first_digit + 3; i -= 3) {
        text.insert(i - 3, 1, ',');
    }
    return text;
}

std::string TextTable::text() const {
    std::vector<std::size_t> widths;
    for (const std::vector<std::string>& row : m_rows) {
        widths.resize(std::max(widths.size(), row.size()));
        for (std::size_t i = 0; i < row.size(); ++i) {
            widths[i] = std::max(widths[i], row[i].size());
        }
    }
    std::string text;
    for (const std::vector<std::string>& row : m_rows) {
        for (std::size_t i = 0; i < row.size(); ++i) {
            text += i == 0 ? fmt::format("  {:<{}}", row[i], widths[i])
                           : fmt::format("  {:>{}}", row[i], widths[i]);
        }
        text.erase(text.find_last_not_of(' ') + 1) += '\n';
    }
    return text;
}

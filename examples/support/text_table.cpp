#include "text_table.h"

#include <algorithm>
#include <cstddef>

std::string TextTable::text() const {
    std::vector<std::size_t> width;
    for (const std::vector<std::string>& row : m_rows) {
        width.resize(std::max(width.size(), row.size()));
        for (std::size_t i = 0; i < row.size(); ++i) {
            width[i] = std::max(width[i], row[i].size());
        }
    }
    std::string text;
    for (const std::vector<std::string>& row : m_rows) {
        std::string line;
        for (std::size_t i = 0; i < row.size(); ++i) {
            const std::string filler(width[i] - row[i].size(), ' ');
            line += "  " + (i == 0 ? row[i] + filler : filler + row[i]);
        }
        line.erase(line.find_last_not_of(' ') + 1);
        text += line + "\n";
    }
    return text;
}

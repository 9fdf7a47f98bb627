// Tables whose columns line up.
#ifndef EXAMPLES_TEXT_TABLE_H
#define EXAMPLES_TEXT_TABLE_H

#include <string>
#include <utility>
#include <vector>

/// Rows of cells under a heading. The first column is aligned to the left, the others to the right.
class TextTable {
public:
    explicit TextTable(std::vector<std::string> heading) : m_rows{std::move(heading)} {}

    void add(std::vector<std::string> row) { m_rows.push_back(std::move(row)); }
    /// The lines, each indented by two blanks.
    std::string text() const;

private:
    std::vector<std::vector<std::string>> m_rows;
};

#endif

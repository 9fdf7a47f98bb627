// Numbers and tables as reports print them, the same in every locale.
#ifndef EXAMPLES_TEXT_H
#define EXAMPLES_TEXT_H

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

/// `value` with so many decimals; never `-0`.
std::string fixed_text(double value, int decimals);

/// The same with a comma between thousands.
std::string number_text(double value, int decimals);
inline std::string number_text(std::int64_t value) {
    return number_text(static_cast<double>(value), 0);
}

/// Rows of cells under a heading, in columns. The first column is aligned to the left, the others to the
/// right.
class TextTable {
public:
    explicit TextTable(std::vector<std::string> heading) : m_rows{std::move(heading)} {}

    void add(std::vector<std::string> row) { m_rows.push_back(std::move(row)); }
    bool empty() const { return m_rows.size() == 1; }
    /// The lines, each indented by two blanks.
    std::string text() const;

private:
    std::vector<std::vector<std::string>> m_rows;
};

#endif

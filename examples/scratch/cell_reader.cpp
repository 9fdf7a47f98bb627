#include "cell_reader.h"

bool CellReader::next(Cell& cell) {
    if (m_next == m_store.points()) {
        return false;
    }
    const std::int64_t first = m_next;
    const Point& lowest = m_store.at(first);
    do {
        ++m_next;
    } while (m_next < m_store.points() && m_store.at(m_next).row == lowest.row &&
             m_store.at(m_next).column == lowest.column);
    cell = {lowest.row,
            lowest.column,
            m_next - first,
            lowest.up,
            m_store.at(first + (m_next - first - 1) / 2).up,
            m_store.at(m_next - 1).up};
    return true;
}

// Sums of very many terms that lose nothing worth printing.
#ifndef WORKAREA_EXACT_SUM_H
#define WORKAREA_EXACT_SUM_H

#include <cmath>

/// Compensated sum: the error does not grow with the number of terms. A plain sum over 100 million cells
/// leaves tens of cubic metres between a cut and a fill that must be equal. Source: Neumaier, 1974.
class ExactSum {
public:
    void add(double term) {
        const double sum = m_sum + term;
        m_lost += std::abs(m_sum) >= std::abs(term) ? (m_sum - sum) + term : (term - sum) + m_sum;
        m_sum = sum;
    }
    double value() const { return m_sum + m_lost; }

private:
    double m_sum = 0.0;
    double m_lost = 0.0;
};

#endif

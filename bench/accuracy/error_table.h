/// Sizes of errors, sorted into bands, as a Markdown table.
#ifndef BASALT_BENCH_ACCURACY_ERROR_TABLE_H
#define BASALT_BENCH_ACCURACY_ERROR_TABLE_H

#include <string>
#include <vector>

namespace accuracy {

/// The errors of one quantity in one band.
class ErrorSizes {
public:
    void add(long double error);
    /// "median / RMS / largest", two digits each; a dash when nothing was added.
    std::string text() const;

private:
    std::vector<double> m_sizes;
};

/// One row a band of the variable that matters, one column a quantity.
class ErrorTable {
public:
    /// Bounds hold one value more than there are bands; a value on a bound belongs to the band above it, on
    /// the last bound to the last band.
    ErrorTable(std::vector<std::string> bands, std::vector<double> bounds,
               std::vector<std::string> quantities);

    /// The errors of a value of the band variable; values outside all bands are left out.
    void add(double value, const std::vector<long double>& errors);
    void add_refusal(double value);
    /// The column of refusals is left out when there are none.
    void print(const char* band_title) const;

private:
    struct Band {
        std::string name;
        int count = 0;
        int refusals = 0;
        std::vector<ErrorSizes> sizes;
    };

    Band* band_of(double value);

    std::vector<Band> m_bands;
    std::vector<double> m_bounds;
    std::vector<std::string> m_quantities;
};

}  // namespace accuracy

#endif

#include "bench/accuracy/error_table.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <utility>

namespace accuracy {

void ErrorSizes::add(long double error) {
    m_sizes.push_back(static_cast<double>(std::abs(error)));
}

std::string ErrorSizes::text() const {
    if (m_sizes.empty()) {
        return "-";
    }
    std::vector<double> sorted = m_sizes;
    std::sort(sorted.begin(), sorted.end());
    double squares = 0.0;
    for (const double size : sorted) {
        squares += size * size;
    }
    const double rms = std::sqrt(squares / static_cast<double>(sorted.size()));
    std::array<char, 80> text = {};
    std::snprintf(text.data(), text.size(), "%.1e / %.1e / %.1e", sorted[sorted.size() / 2], rms,
                  sorted.back());
    return text.data();
}

ErrorTable::ErrorTable(std::vector<std::string> bands, std::vector<double> bounds,
                       std::vector<std::string> quantities)
    : m_bounds(std::move(bounds)), m_quantities(std::move(quantities)) {
    for (std::string& name : bands) {
        m_bands.push_back({std::move(name), 0, 0, std::vector<ErrorSizes>(m_quantities.size())});
    }
}

ErrorTable::Band* ErrorTable::band_of(double value) {
    if (!(value >= m_bounds.front() && value <= m_bounds.back())) {
        return nullptr;
    }
    const auto above = std::upper_bound(m_bounds.begin(), m_bounds.end() - 1, value);
    return &m_bands[static_cast<std::size_t>(above - m_bounds.begin() - 1)];
}

void ErrorTable::add(double value, const std::vector<long double>& errors) {
    if (Band* band = band_of(value)) {
        ++band->count;
        for (std::size_t i = 0; i < errors.size(); ++i) {
            band->sizes[i].add(errors[i]);
        }
    }
}

void ErrorTable::add_refusal(double value) {
    if (Band* band = band_of(value)) {
        ++band->count;
        ++band->refusals;
    }
}

void ErrorTable::print(const char* band_title) const {
    const bool refusing =
        std::any_of(m_bands.begin(), m_bands.end(), [](const Band& band) { return band.refusals != 0; });
    std::printf("\n| %s | cases |%s", band_title, refusing ? " refused |" : "");
    for (const std::string& quantity : m_quantities) {
        std::printf(" %s |", quantity.c_str());
    }
    std::printf("\n|---|---|%s", refusing ? "---|" : "");
    for (std::size_t i = 0; i < m_quantities.size(); ++i) {
        std::printf("---|");
    }
    std::printf("\n");
    for (const Band& band : m_bands) {
        std::printf("| %s | %d |", band.name.c_str(), band.count);
        if (refusing) {
            std::printf(" %d |", band.refusals);
        }
        for (const ErrorSizes& sizes : band.sizes) {
            std::printf(" %s |", sizes.text().c_str());
        }
        std::printf("\n");
    }
    std::printf("\n");
}

}  // namespace accuracy

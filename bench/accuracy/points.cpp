#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <random>

#include "bench/accuracy/accuracy.h"

namespace accuracy {

namespace {

/// The standard's distributions differ between libraries, its generators do not.
class Random {
public:
    double between(double low, double high) {
        return low + (high - low) * static_cast<double>(m_engine() >> 11) * 0x1p-53;
    }
    int below(int count) { return static_cast<int>(between(0.0, count)); }

private:
    std::mt19937_64 m_engine{20261124};
};

double latitude(Random& random) {
    constexpr double RAD = 57.29577951308232;
    const double sign = random.below(2) == 0 ? 1.0 : -1.0;
    switch (random.below(8)) {
        case 0:
            return sign * std::pow(10.0, random.between(-9.0, 0.0));
        case 1:
            return sign * (80.0 + random.between(-0.01, 0.01));
        case 2:
            return sign * (90.0 - std::pow(10.0, random.between(-9.0, 1.0)));
        case 3:
            return sign * std::array{0.0, 45.0, 80.0, 90.0}[static_cast<std::size_t>(random.below(4))];
        default:
            return std::asin(random.between(-1.0, 1.0)) * RAD;
    }
}

double longitude(Random& random) {
    switch (random.below(8)) {
        case 0:
            return std::array{-180.0, -90.0, 0.0, 90.0, 180.0}[static_cast<std::size_t>(random.below(5))];
        case 1:
            return (random.below(2) == 0 ? 180.0 : -180.0) *
                   (1.0 - std::pow(10.0, random.between(-12.0, -2.0)));
        default:
            return random.between(-180.0, 180.0);
    }
}

}  // namespace

void print_points(int count) {
    // The height bands of the tables get equal shares, the deep ones smaller ones.
    constexpr std::array BOUNDS = {-6350e3, -6200e3, -6100e3, -6000e3, -1000e3, -11e3,
                                   0.0,     1e3,     10e3,    100e3,   1000e3,  20000e3};
    Random random;
    for (int i = 0; i < count; ++i) {
        const int band = i % 4 == 0 ? random.below(5) : 5 + random.below(6);
        const double height = random.between(BOUNDS[static_cast<std::size_t>(band)],
                                             BOUNDS[static_cast<std::size_t>(band) + 1]);
        const double lat = latitude(random);
        std::printf("%.14f %.14f %.7f\n", lat, longitude(random), height);
    }
}

void print_lines(int count) {
    Random random;
    for (int i = 0; i < count; ++i) {
        const double azimuth =
            random.below(8) == 0 ? -180.0 + 90.0 * random.below(5) : random.between(-180.0, 180.0);
        const double distance = 2.0 * std::pow(10.0, random.between(-0.30103, 7.0));
        const double lat = latitude(random);
        std::printf("%.14f %.14f %.14f %.9f\n", lat, longitude(random), azimuth, distance);
    }
}

void print_pairs(int count) {
    Random random;
    for (int i = 0; i < count; ++i) {
        const double lat = latitude(random);
        const double lon = longitude(random);
        const double other = latitude(random);
        const double apart = random.between(-180.0, 180.0);
        // Degrees: 0.1 mm to 300 km.
        const double size = std::pow(10.0, random.between(-9.0, 0.5));
        const double north = random.between(-size, size);
        const double east = random.between(-size, size);
        const double pairs[][4] = {{lat, lon, other, lon + apart},
                                   {lat, lon, lat + north, lon + east},
                                   {lat, lon, -lat + north, lon + 180.0 + east},
                                   {lat, lon, other, lon},
                                   {0.0, lon, 0.0, lon + apart},
                                   {std::copysign(90.0, lat), lon, other, lon + apart},
                                   {lat, lon, lat + apart / 20.0, lon + other / 10.0},
                                   {0.0, lon, north * 1e-3, lon + 180.0 + east}};
        const auto& [lat1, lon1, lat2, lon2] = pairs[i % 8];
        std::printf("%.14f %.14f %.14f %.14f\n", lat1, lon1, std::clamp(lat2, -90.0, 90.0), lon2);
    }
}

}  // namespace accuracy

// Plain loops over columns of doubles by name; whole numbers and truth values travel in them exactly.
#ifndef BASALT_BINDINGS_PYTHON_TESTS_LOOPS_H
#define BASALT_BINDINGS_PYTHON_TESTS_LOOPS_H

#include <cstddef>
#include <cstring>

#include "basalt/geo.h"

using In = const double* const*;
using Out = double* const*;
using Loop = void (*)(std::size_t, In, Out);

struct Named {
    const char* name;
    Loop loop;
};

template <class Body>
constexpr Loop loop_of(Body) {
    return [](std::size_t count, In in, Out out) {
        for (std::size_t i = 0; i < count; ++i) {
            Body{}(i, in, out);
        }
    };
}

inline geo_nee point(In in, int first, std::size_t i) {
    return {in[first][i], in[first + 1][i], in[first + 2][i]};
}

inline geo_nee flat(In in, int first, std::size_t i) {
    return {in[first][i], in[first + 1][i], 0};
}

inline geo_vector vector(In in, int first, std::size_t i) {
    return {in[first][i], in[first + 1][i], in[first + 2][i]};
}

inline geo_llh place(In in, int first, std::size_t i) {
    return {in[first][i], in[first + 1][i], 0};
}

inline void put(const geo_nee& end, Out out, std::size_t i) {
    out[0][i] = end.north;
    out[1][i] = end.east;
    out[2][i] = end.elevation;
}

// Null for a name that is not there.
template <std::size_t N>
Loop loop_named(const Named (&loops)[N], const char* name) {
    for (const Named& named : loops) {
        if (std::strcmp(named.name, name) == 0) {
            return named.loop;
        }
    }
    return nullptr;
}

Loop plane_loop(const char* name);
Loop curve_and_observation_loop(const char* name);
Loop geodesy_loop(const char* name);
Loop time_and_unit_loop(const char* name);

#endif

// The WGS84 ellipsoid, lines on it, and covariances of positions.
#include <algorithm>
#include <cstddef>

#include "basalt/geo.h"
#include "basalt/geo/arrays.h"
#include "basalt/geo/local_frame.h"
#include "universal.h"

namespace basalt_python {

namespace {

// Arguments: x, y, z, six numbers; six numbers out.
template <int (*TRANSFORM)(const geo_vector*, const double*, double*)>
void each_covariance(char** arguments, const npy_intp* sizes, const npy_intp* steps, void*) {
    for (npy_intp i = 0; i < sizes[0]; ++i) {
        const auto number = [&](int argument, npy_intp offset) {
            return *reinterpret_cast<const double*>(arguments[argument] + i * steps[argument] + offset);
        };
        const geo_vector position{number(0, 0), number(1, 0), number(2, 0)};
        double covariance[6];
        for (npy_intp k = 0; k < 6; ++k) {
            covariance[k] = number(3, k * steps[5]);
        }
        TRANSFORM(&position, covariance, covariance);
        for (npy_intp k = 0; k < 6; ++k) {
            *reinterpret_cast<double*>(arguments[4] + i * steps[4] + k * steps[6]) = covariance[k];
        }
    }
    clear_float_flags();
}

template <int (*TRANSFORM)(const geo_vector*, const double*, double*)>
void add_covariance(pybind11::module_& m, const char* name, const char* text) {
    static PyUFuncGenericFunction loop = &each_covariance<TRANSFORM>;
    static char types[] = {NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE, NPY_DOUBLE};
    add_general(m, name, text, "(),(),(),(6)->(6)", &loop, types, 4, 1);
}

// Arguments: the frame's origin and a point; the converted point.
template <class In, class Out, std::size_t (basalt::LocalFrame::*CONVERT)(const In*, Out*, std::size_t) const>
void add_frame(pybind11::module_& m, const char* name) {
    add_blocks<6, 3>(m, name, "See LocalFrame.", [](const Column* columns, std::size_t count) {
        geo_llh origins[BLOCK];
        In in[BLOCK];
        Out out[BLOCK];
        read_records(columns, origins, count);
        read_records(columns + 3, in, count);
        const bool is_one_frame = columns[0].step == 0 && columns[1].step == 0 && columns[2].step == 0;
        const std::size_t run = is_one_frame ? count : 1;
        for (std::size_t i = 0; i < count; i += run) {
            (basalt::LocalFrame(origins[i]).*CONVERT)(in + i, out + i, run);
        }
        write_records(columns + 6, out, count);
    });
}

// Of the places whose latitudes and longitudes are the first columns.
template <auto MEASURE, class Result>
void between_places(const Column* columns, Result* results, std::size_t count) {
    geo_llh from[BLOCK], to[BLOCK];
    for (std::size_t i = 0; i < count; ++i) {
        from[i] = {columns[0][i], columns[1][i], 0};
        to[i] = {columns[2][i], columns[3][i], 0};
    }
    MEASURE(from, to, results, count);
}

using Measure = std::size_t (*)(const geo_llh*, const geo_llh*, double*, std::size_t);

template <Measure MEASURE>
void write_between_places(const Column* columns, std::size_t count) {
    double measured[BLOCK];
    between_places<MEASURE>(columns, measured, count);
    write_numbers(columns[4], measured, count);
}

}  // namespace

void add_geodesy(pybind11::module_& m) {
    add_blocks<3, 3>(
        m, "llh_to_xyz",
        "llh_to_xyz(latitude, longitude, height): (x, y, z), metres; NaN where all three are 0, which is "
        "refused as a record never set (_llh2xyz).",
        [](const Column* columns, std::size_t count) {
            geo_llh llh[BLOCK];
            geo_vector xyz[BLOCK];
            read_records(columns, llh, count);
            std::fill_n(xyz, count, geo_vector{NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER});
            basalt::to_cartesian(llh, xyz, count);
            write_records(columns + 3, xyz, count);
        });
    add_blocks<4, 3>(m, "_xyz_to_llh", "See xyz_to_llh.", [](const Column* columns, std::size_t count) {
        geo_vector xyz[BLOCK];
        geo_llh llh[BLOCK];
        double tolerances[BLOCK];
        read_records(columns, xyz, count);
        read_numbers(columns[3], tolerances, count);
        std::fill_n(llh, count, geo_llh{NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER});
        const std::size_t run = columns[3].step == 0 ? count : 1;
        for (std::size_t i = 0; i < count; i += run) {
            basalt::to_geodetic(xyz + i, llh + i, run, tolerances[i]);
        }
        write_records(columns + 4, llh, count);
    });
    add(m, "xyz_to_local",
        "xyz_to_local(origin_x, origin_y, origin_z, x, y, z): (north, east, elevation) in the plane that "
        "touches the ellipsoid below the origin, metres; NaN where the origin cannot be converted "
        "(_xyz2nez).",
        [](double ox, double oy, double oz, double x, double y, double z) {
            const geo_vector origin{ox, oy, oz};
            const geo_vector point{x, y, z};
            geo_nee out{NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER};
            _xyz2nez(&origin, &point, &out);
            return std::tuple{out.north, out.east, out.elevation};
        });
    add(m, "curvature_radii",
        "curvature_radii(latitude): (meridian, prime_vertical), metres (_wgs84curvature).",
        [](double latitude) {
            double meridian = 0, prime_vertical = 0;
            _wgs84curvature(latitude, meridian, prime_vertical);
            return std::tuple{meridian, prime_vertical};
        });
    add_blocks<6, 1, bool>(
        m, "llh_equal",
        "llh_equal(latitude1, longitude1, height1, latitude2, longitude2, height2): whether the points are "
        "less than 0.5 mm apart in space (llh_equal).",
        [](const Column* columns, std::size_t count) {
            geo_llh llh[2][BLOCK];
            geo_vector xyz[2][BLOCK];
            for (std::size_t k = 0; k < 2; ++k) {
                read_records(columns + 3 * k, llh[k], count);
                // What to_cartesian() leaves untouched are three zeros, a place on the equator here.
                std::fill_n(xyz[k], count, geo_vector{6378137.0, 0.0, 0.0});
                basalt::to_cartesian(llh[k], xyz[k], count);
            }
            for (std::size_t i = 0; i < count; ++i) {
                columns[6].at<bool>(i) = geo_dist_equal(geo_vector_length(xyz[0][i], xyz[1][i]), 0.0);
            }
        });
    add_frame<geo_llh, geo_nee, &basalt::LocalFrame::to_local>(m, "_frame_llh_to_local");
    add_frame<geo_vector, geo_nee, &basalt::LocalFrame::to_local>(m, "_frame_xyz_to_local");
    add_frame<geo_nee, geo_llh, &basalt::LocalFrame::to_geodetic>(m, "_frame_local_to_llh");
    add_frame<geo_nee, geo_vector, &basalt::LocalFrame::to_cartesian>(m, "_frame_local_to_xyz");
    add(m, "_is_frame_origin", "See LocalFrame.", [](double latitude, double longitude, double height) {
        return basalt::LocalFrame({latitude, longitude, height}).valid();
    });
    add_blocks<4, 3>(
        m, "direct",
        "direct(latitude, longitude, azimuth, distance): (latitude, longitude, azimuth) at the end of a "
        "geodesic; azimuths in [-pi, pi], the longitude not wrapped (geo_vincenty_direct).",
        [](const Column* columns, std::size_t count) {
            geo_llh starts[BLOCK], ends[BLOCK];
            double azimuths[BLOCK], distances[BLOCK], at_ends[BLOCK];
            for (std::size_t i = 0; i < count; ++i) {
                starts[i] = {columns[0][i], columns[1][i], 0};
                azimuths[i] = columns[2][i];
                distances[i] = columns[3][i];
            }
            basalt::direct(starts, azimuths, distances, ends, at_ends, count);
            for (std::size_t i = 0; i < count; ++i) {
                columns[4][i] = ends[i].latitude;
                columns[5][i] = ends[i].longitude;
                columns[6][i] = at_ends[i];
            }
        });
    add_blocks<4, 3>(
        m, "geodesic_inverse",
        "geodesic_inverse(latitude1, longitude1, latitude2, longitude2): (distance, azimuth_from, "
        "azimuth_to) "
        "of the shortest line on the ellipsoid, metres and radians in [-pi, pi]; exact to 1.5e-8 m for every "
        "pair of places, NaN for a latitude beyond a pole (basalt::geodesic_inverse).",
        [](const Column* columns, std::size_t count) {
            basalt::GeodesicInverse lines[BLOCK];
            between_places<&basalt::inverse>(columns, lines, count);
            write_records(columns + 4, lines, count);
        });
    add_blocks<4, 1>(
        m, "great_circle_distance",
        "great_circle_distance(latitude1, longitude1, latitude2, longitude2): metres on a sphere of 6371 "
        "km, up to 0.6 % off; geodesic_inverse is exact (geo_vincenty_distance).",
        [](const Column* columns, std::size_t count) {
            write_between_places<&basalt::distances>(columns, count);
        });
    add_blocks<4, 1>(
        m, "great_circle_bearing",
        "great_circle_bearing(latitude1, longitude1, latitude2, longitude2): radians in [0, 2 pi) on a "
        "sphere; geodesic_inverse is exact (geo_vincenty_bearing).",
        [](const Column* columns, std::size_t count) {
            write_between_places<&basalt::bearings>(columns, count);
        });
    add(m, "cross_track",
        "cross_track(latitude1, longitude1, latitude2, longitude2, latitude, longitude): metres from the "
        "line that leaves point 1 with the bearing of point 2, positive left of it "
        "(geo_vincenty_crosstrack).",
        [](double lat1, double lon1, double lat2, double lon2, double lat, double lon) {
            return geo_vincenty_crosstrack({lat1, lon1, 0}, {lat2, lon2, 0}, {lat, lon, 0});
        });
    add_covariance<&Varxyz2varllh>(m, "covariance_to_llh",
                                   "covariance_to_llh(x, y, z, covariance): covariance of latitude, "
                                   "longitude, height. Six numbers along the last axis: variances of 0, 1, "
                                   "2, covariances 01, 02, 12; GEO_NULL for a position that cannot be "
                                   "converted (Varxyz2varllh).");
    add_covariance<&Varxyz2varneu>(
        m, "covariance_to_neu",
        "covariance_to_neu(x, y, z, covariance): covariance of north, east, up; as covariance_to_llh "
        "(Varxyz2varneu).");
}

}  // namespace basalt_python

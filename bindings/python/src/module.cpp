// The extension module, which the package's Python files import from.
#define BASALT_PYTHON_MODULE
#include "universal.h"

#include <algorithm>
#include <cstddef>
#include <deque>
#include <string>
#include <string_view>

#include "basalt/geo.h"
#include "basalt/version.h"

namespace {

// NumPy's macros return from the function that they are in.
bool import_numpy() {
    import_array1(false);
    import_umath1(false);
    return true;
}

constexpr std::string_view RADIANS[] = {"angle",    "azimuth",   "bearing",     "horizontal",
                                        "latitude", "longitude", "slope_angle", "vertical"};
constexpr std::string_view METRES[] = {"distance",      "east",      "easts", "elevation", "height",
                                       "height_change", "length",    "north", "norths",    "radius",
                                       "separation",    "tolerance", "x",     "y",         "z"};

// "p_north1" is a north, "origin_x" an x.
std::string_view quantity_of(std::string_view argument) {
    for (const std::string_view prefix : {"a_", "b_", "p_", "q_", "origin_"}) {
        if (argument.substr(0, prefix.size()) == prefix) {
            argument.remove_prefix(prefix.size());
        }
    }
    return argument.substr(0, argument.find_last_not_of("0123456789") + 1);
}

}  // namespace

const char* basalt_python::with_units(const char* text) {
    static std::deque<std::string> kept;
    const std::string_view all = text;
    const std::size_t open = all.find('('), close = all.find(')');
    std::string radians, metres;
    if (open != all.npos && close != all.npos) {
        for (std::size_t at = open + 1; at < close;) {
            const std::size_t end = std::min(all.find(", ", at), close);
            const std::string_view argument = all.substr(at, end - at);
            const auto note = [&](const auto& names, std::string& list) {
                if (std::find(std::begin(names), std::end(names), quantity_of(argument)) != std::end(names)) {
                    list.append(list.empty() ? "" : ", ").append(argument);
                }
            };
            note(RADIANS, radians);
            note(METRES, metres);
            at = end + 2;
        }
    }
    std::string& made = kept.emplace_back(text);
    made.append(radians.empty() && metres.empty() ? "" : "\n");
    made.append(radians.empty() ? "" : "\nIn radians: " + radians + ".");
    made.append(metres.empty() ? "" : "\nIn metres: " + metres + ".");
    return made.c_str();
}

PYBIND11_MODULE(_basalt, module) {
    if (!import_numpy()) {
        throw pybind11::error_already_set();
    }
    module.attr("VERSION") = BASALT_VERSION;
    module.attr("GEO_NULL") = GEO_NULL;
    module.attr("GEO_INFINITY") = GEO_INFINITY;
    basalt_python::add_plane(module);
    basalt_python::add_vectors(module);
    basalt_python::add_polygons(module);
    basalt_python::add_observations(module);
    basalt_python::add_geodesy(module);
    basalt_python::add_time_and_units(module);
    basalt_python::add_sparse(module);
    basalt_python::add_text(module);
}

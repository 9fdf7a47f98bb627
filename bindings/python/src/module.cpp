// The extension module: everything that the package's Python files are made of.
#define BASALT_PYTHON_MODULE
#include "universal.h"

#include "basalt/geo.h"

namespace {

// NumPy's macros return from where they stand.
bool numpy_is_there() {
    import_array1(false);
    import_umath1(false);
    return true;
}

}  // namespace

PYBIND11_MODULE(_basalt, module) {
    if (!numpy_is_there()) {
        throw pybind11::error_already_set();
    }
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

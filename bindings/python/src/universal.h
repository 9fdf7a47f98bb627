// NumPy universal functions made of plain ones: NumPy broadcasts, converts what has another type, walks
// strides without a copy and releases its lock around the loops that stand here.
#ifndef BASALT_BINDINGS_PYTHON_UNIVERSAL_H
#define BASALT_BINDINGS_PYTHON_UNIVERSAL_H

#include <pybind11/pybind11.h>

#define NPY_NO_DEPRECATED_API NPY_1_7_API_VERSION
#define PY_ARRAY_UNIQUE_SYMBOL basalt_python_array
#define PY_UFUNC_UNIQUE_SYMBOL basalt_python_ufunc
#ifndef BASALT_PYTHON_MODULE
#define NO_IMPORT_ARRAY
#define NO_IMPORT_UFUNC
#endif
#include <numpy/arrayobject.h>
#include <numpy/ufuncobject.h>

#include <algorithm>
#include <array>
#include <cfenv>
#include <cstddef>
#include <cstdint>
#include <exception>
#include <limits>
#include <new>
#include <tuple>
#include <type_traits>
#include <utility>

namespace basalt_python {

inline constexpr double NOT_A_NUMBER = std::numeric_limits<double>::quiet_NaN();

template <class T>
constexpr char type_number() {
    if constexpr (std::is_same_v<T, double>) {
        return NPY_DOUBLE;
    } else if constexpr (std::is_same_v<T, bool>) {
        return NPY_BOOL;
    } else if constexpr (std::is_same_v<T, std::uint64_t>) {
        return NPY_UINT64;
    } else {
        static_assert(std::is_same_v<T, std::int64_t>, "integers are passed as 64 bits");
        return NPY_INT64;
    }
}

template <class T>
struct Results {
    using Tuple = std::tuple<T>;
};
template <class... T>
struct Results<std::tuple<T...>> {
    using Tuple = std::tuple<T...>;
};

// Markers and NaN are documented results: NumPy would warn of their floating-point flags.
inline void clear_float_flags() {
    std::feclearexcept(FE_ALL_EXCEPT);
}

// Takes ownership of what a call of Python's API made; throws Python's error for null.
inline pybind11::object owned(PyObject* made) {
    if (made == nullptr) {
        throw pybind11::error_already_set();
    }
    return pybind11::reinterpret_steal<pybind11::object>(made);
}

// An exception may not pass through NumPy, which runs without the interpreter's lock.
template <class Loop>
void as_python_error(Loop loop) noexcept {
    const auto raise = [](PyObject* type, const char* text) {
        NPY_ALLOW_C_API_DEF
        NPY_ALLOW_C_API
        PyErr_SetString(type, text);
        NPY_DISABLE_C_API
    };
    try {
        loop();
    } catch (const std::bad_alloc&) {
        raise(PyExc_MemoryError, "out of memory");
    } catch (const std::exception& error) {
        raise(PyExc_ValueError, error.what());
    }
}

// A kernel is a lambda without captures: numbers in, a number or a tuple of numbers out.
template <class Kernel, class Signature = decltype(&Kernel::operator())>
struct Universal;

template <class Kernel, class Out, class... In>
struct Universal<Kernel, Out (Kernel::*)(In...) const> {
    using Tuple = typename Results<Out>::Tuple;
    static constexpr int INPUTS = sizeof...(In);
    static constexpr int OUTPUTS = static_cast<int>(std::tuple_size_v<Tuple>);

    static void run(char** arguments, const npy_intp* sizes, const npy_intp* steps, void*) {
        as_python_error([&] {
            step_through(arguments, *sizes, steps, std::make_index_sequence<INPUTS>{},
                         std::make_index_sequence<OUTPUTS>{});
        });
        clear_float_flags();
    }

    template <std::size_t... I, std::size_t... O>
    static void step_through(char** arguments, npy_intp count, const npy_intp* steps,
                             std::index_sequence<I...>, std::index_sequence<O...>) {
        const auto loop = [&](const auto& step) {
            for (npy_intp i = 0; i < count; ++i) {
                const Tuple results{
                    Kernel{}(*reinterpret_cast<const In*>(arguments[I] + i * step(I, sizeof(In)))...)};
                ((*reinterpret_cast<std::tuple_element_t<O, Tuple>*>(
                      arguments[INPUTS + O] + i * step(INPUTS + O, sizeof(std::tuple_element_t<O, Tuple>))) =
                      std::get<O>(results)),
                 ...);
            }
        };
        const bool is_contiguous = ((steps[I] == sizeof(In)) && ...) &&
                                   ((steps[INPUTS + O] == sizeof(std::tuple_element_t<O, Tuple>)) && ...);
        if (is_contiguous) {  // a loop of its own, which the compiler may vectorise
            loop([](std::size_t, std::size_t size) { return static_cast<npy_intp>(size); });
        } else {
            loop([&](std::size_t argument, std::size_t) { return steps[argument]; });
        }
    }

    template <std::size_t... O>
    static constexpr std::array<char, INPUTS + OUTPUTS> types_of(std::index_sequence<O...>) {
        return {type_number<In>()..., type_number<std::tuple_element_t<O, Tuple>>()...};
    }
    static constexpr auto TYPES = types_of(std::make_index_sequence<OUTPUTS>{});
};

// A function's help with the units of its arguments, which their names imply. The text is never freed.
const char* with_units(const char* text);

// Adds a universal function to a module; name and text have static storage. Of several kernels, for other
// types of the same numbers, NumPy takes the first whose types hold what it is given.
template <class Kernel, class... Others>
void add(pybind11::module_& module, const char* name, const char* text, Kernel, Others...) {
    using First = Universal<Kernel>;
    constexpr int KERNELS = 1 + sizeof...(Others);
    static PyUFuncGenericFunction loops[] = {&First::run, &Universal<Others>::run...};
    static void* nothing[KERNELS] = {};
    static auto types =
        std::array<std::array<char, First::TYPES.size()>, KERNELS>{First::TYPES, Universal<Others>::TYPES...};
    PyObject* made = PyUFunc_FromFuncAndData(loops, nothing, types[0].data(), KERNELS, First::INPUTS,
                                             First::OUTPUTS, PyUFunc_None, name, with_units(text), 0);
    module.attr(name) = owned(made);
}

// The numbers of one argument.
struct Column {
    char* first;
    npy_intp step;

    template <class T>
    T& at(std::size_t i) const {
        return *reinterpret_cast<T*>(first + static_cast<npy_intp>(i) * step);
    }
    double& operator[](std::size_t i) const { return at<double>(i); }
};

// Runs loop(i, number) over rows of columns; number(k) is that of column k. Where the numbers of each column
// lie side by side it is a loop of its own.
template <std::size_t COLUMNS, class Loop>
void each_row(const Column* columns, std::size_t count, Loop loop) {
    const auto walk = [&](const auto& step) {
        for (std::size_t i = 0; i < count; ++i) {
            loop(i, [&](std::size_t k) -> double& {
                return *reinterpret_cast<double*>(columns[k].first + static_cast<npy_intp>(i) * step(k));
            });
        }
    };
    if (std::all_of(columns, columns + COLUMNS, [](const Column& c) { return c.step == sizeof(double); })) {
        walk([](std::size_t) { return static_cast<npy_intp>(sizeof(double)); });
    } else {
        walk([&](std::size_t k) { return columns[k].step; });
    }
}

inline void read_numbers(const Column& column, double* numbers, std::size_t count) {
    each_row<1>(&column, count, [=](std::size_t i, const auto& number) { numbers[i] = number(0); });
}

inline void write_numbers(const Column& column, const double* numbers, std::size_t count) {
    each_row<1>(&column, count, [=](std::size_t i, const auto& number) { number(0) = numbers[i]; });
}

template <class Record>
void read_records(const Column* columns, Record* records, std::size_t count) {
    each_row<3>(columns, count, [=](std::size_t i, const auto& number) {
        records[i] = {number(0), number(1), number(2)};
    });
}

template <class Record>
void write_records(const Column* columns, const Record* records, std::size_t count) {
    each_row<3>(columns, count, [=](std::size_t i, const auto& number) {
        const auto& [first, second, third] = records[i];
        number(0) = first;
        number(1) = second;
        number(2) = third;
    });
}

// How many items a kernel for blocks takes at most: their records fit into the first-level cache.
constexpr std::size_t BLOCK = 256;

template <int ARGUMENTS, class Kernel>
void each_block(char** arguments, const npy_intp* sizes, const npy_intp* steps, void*) {
    as_python_error([&] {
        std::array<Column, ARGUMENTS> columns;
        for (std::size_t i = 0; i < columns.size(); ++i) {
            columns[i] = {arguments[i], steps[i]};
        }
        for (auto left = static_cast<std::size_t>(*sizes); left != 0;) {
            const std::size_t count = std::min(left, BLOCK);
            Kernel{}(columns.data(), count);
            for (Column& column : columns) {
                column.first += static_cast<npy_intp>(count) * column.step;
            }
            left -= count;
        }
    });
    clear_float_flags();
}

// Adds a universal function over the library's array calls. The kernel takes the columns, inputs first, and
// a count of items; it reads all of them before it writes, since an output may be an input.
template <int INPUTS, int OUTPUTS, class Out = double, class Kernel>
void add_blocks(pybind11::module_& module, const char* name, const char* text, Kernel) {
    static PyUFuncGenericFunction loop = &each_block<INPUTS + OUTPUTS, Kernel>;
    static void* nothing = nullptr;
    static std::array<char, INPUTS + OUTPUTS> types;
    types.fill(NPY_DOUBLE);
    std::fill_n(types.begin() + INPUTS, OUTPUTS, type_number<Out>());
    PyObject* made = PyUFunc_FromFuncAndData(&loop, &nothing, types.data(), 1, INPUTS, OUTPUTS, PyUFunc_None,
                                             name, with_units(text), 0);
    module.attr(name) = owned(made);
}

// Adds one whose items are arrays themselves, by NumPy's signature; the loop is NumPy's generic one.
inline void add_general(pybind11::module_& module, const char* name, const char* text, const char* signature,
                        PyUFuncGenericFunction* loop, char* types, int inputs, int outputs) {
    static void* nothing = nullptr;
    PyObject* made = PyUFunc_FromFuncAndDataAndSignature(loop, &nothing, types, 1, inputs, outputs,
                                                         PyUFunc_None, name, with_units(text), 0, signature);
    module.attr(name) = owned(made);
}

void add_plane(pybind11::module_& module);
void add_vectors(pybind11::module_& module);
void add_polygons(pybind11::module_& module);
void add_observations(pybind11::module_& module);
void add_geodesy(pybind11::module_& module);
void add_time_and_units(pybind11::module_& module);
void add_sparse(pybind11::module_& module);
void add_text(pybind11::module_& module);

}  // namespace basalt_python

#endif

// Batches of cells of a sparse array. Elements are bytes here; the package's sparse.py gives them their
// dtype.
#include <pybind11/numpy.h>
#include <pybind11/pybind11.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <exception>
#include <limits>
#include <memory>
#include <mutex>
#include <tuple>
#include <utility>
#include <vector>

#include "basalt/sparse.h"
#include "universal.h"

namespace basalt_python {

namespace {

namespace py = pybind11;
using Cells = py::array_t<std::int32_t, py::array::c_style>;
using Bytes = py::array_t<std::uint8_t, py::array::c_style>;
using Flags = py::array_t<bool, py::array::c_style>;

// An array that takes ownership of memory, without a copy.
template <class T>
py::array_t<T> array_of(std::vector<T> values) {
    auto owner = std::make_unique<std::vector<T>>(std::move(values));
    const T* data = owner->data();
    const auto size = static_cast<py::ssize_t>(owner->size());
    const py::capsule capsule(owner.get(), [](void* taken) { delete static_cast<std::vector<T>*>(taken); });
    owner.release();
    return py::array_t<T>(size, data, capsule);
}

class SparseBytes {
public:
    SparseBytes(std::size_t element_size, std::size_t block_side, std::size_t elements_per_chunk)
        : m_size(element_size), m_array(std::max(element_size, LEAST_SIZE), block_side, elements_per_chunk) {}

    void insert(const Cells& x, const Cells& y, const Bytes& elements) {
        check(x, y, elements.size());
        const auto [xs, ys, bytes] = std::tuple{x.data(), y.data(), elements.data()};
        const py::ssize_t count = x.size();
        alone([&] {
            std::uint8_t padded[LEAST_SIZE] = {};
            for (py::ssize_t i = 0; i < count; ++i) {
                const std::uint8_t* element = bytes + static_cast<std::size_t>(i) * m_size;
                if (m_size < LEAST_SIZE) {
                    std::memcpy(padded, element, m_size);
                    element = padded;
                }
                m_array.Insert(xs[i], ys[i], element);
            }
        });
    }

    // Elements, zero where there is none, and whether there is one.
    std::pair<Bytes, Flags> find(const Cells& x, const Cells& y) {
        check(x, y, x.size() * static_cast<py::ssize_t>(m_size));
        const py::ssize_t count = x.size();
        Bytes elements(count * static_cast<py::ssize_t>(m_size));
        Flags found(count);
        const auto [xs, ys] = std::pair{x.data(), y.data()};
        const auto [bytes, flags] = std::pair{elements.mutable_data(), found.mutable_data()};
        alone([&] {
            for (py::ssize_t i = 0; i < count; ++i) {
                const void* element = m_array.Find(xs[i], ys[i]);
                std::uint8_t* to = bytes + static_cast<std::size_t>(i) * m_size;
                flags[i] = element != nullptr;
                if (element != nullptr) {
                    std::memcpy(to, element, m_size);
                } else {
                    std::memset(to, 0, m_size);
                }
            }
        });
        return {std::move(elements), std::move(found)};
    }

    Flags remove(const Cells& x, const Cells& y) {
        check(x, y, x.size() * static_cast<py::ssize_t>(m_size));
        Flags removed(x.size());
        const auto [xs, ys, flags] = std::tuple{x.data(), y.data(), removed.mutable_data()};
        const py::ssize_t count = x.size();
        alone([&] {
            for (py::ssize_t i = 0; i < count; ++i) {
                flags[i] = m_array.Remove(xs[i], ys[i]);
            }
        });
        return removed;
    }

    void clear() {
        alone([&] { m_array.RemoveAll(); });
    }

    using Selected =
        std::tuple<py::array_t<std::int32_t>, py::array_t<std::int32_t>, py::array_t<std::uint8_t>>;

    // What lies inside the rectangle, corners included.
    Selected select(std::int32_t min_x, std::int32_t min_y, std::int32_t max_x, std::int32_t max_y) {
        Window window{{min_x, min_y}, {max_x, max_y}, m_size, {}, {}, {}, {}};
        alone([&] {
            if (m_array.Select(window.min, window.max)) {
                Window* collected = &window;  // the visit hands its context on as read-only
                m_array.IterateSelected(&collect, &collected);
            }
        });
        return given(window);
    }

    Selected all() {
        constexpr int LEAST = std::numeric_limits<std::int32_t>::min();
        constexpr int GREATEST = std::numeric_limits<std::int32_t>::max();
        Window window{{LEAST, LEAST}, {GREATEST, GREATEST}, m_size, {}, {}, {}, {}};
        alone([&] {
            Window* collected = &window;
            m_array.IterateAll(&collect, &collected);
        });
        return given(window);
    }

private:
    static constexpr std::size_t LEAST_SIZE = 8;  // what the library copies at least

    struct Window {
        int min[2];
        int max[2];
        std::size_t size;
        std::vector<std::int32_t> xs, ys;
        std::vector<std::uint8_t> bytes;
        std::exception_ptr error;
    };

    static bool collect(int x, int y, const void* element, const void* context) {
        Window& window = **static_cast<Window* const*>(context);
        if (x < window.min[0] || x > window.max[0] || y < window.min[1] || y > window.max[1]) {
            return true;  // of a block that only meets the rectangle
        }
        try {
            window.xs.push_back(x);
            window.ys.push_back(y);
            const auto* first = static_cast<const std::uint8_t*>(element);
            window.bytes.insert(window.bytes.end(), first, first + window.size);
        } catch (...) {
            window.error = std::current_exception();
        }
        return window.error == nullptr;
    }

    static Selected given(Window& window) {
        if (window.error != nullptr) {
            std::rethrow_exception(window.error);
        }
        return {array_of(std::move(window.xs)), array_of(std::move(window.ys)),
                array_of(std::move(window.bytes))};
    }

    void check(const Cells& x, const Cells& y, py::ssize_t bytes) const {
        if (x.ndim() != 1 || y.ndim() != 1 || x.size() != y.size() ||
            bytes != x.size() * static_cast<py::ssize_t>(m_size)) {
            throw std::invalid_argument("as many x, y and elements are wanted");
        }
    }

    // A batch is one step for other threads of Python, whose interpreter goes on meanwhile. The interpreter's
    // lock is released before this one is taken, which avoids a deadlock.
    template <class Work>
    void alone(Work work) {
        const py::gil_scoped_release others_run;
        const std::lock_guard guard(m_mutex);
        work();
    }

    std::size_t m_size;
    std::mutex m_mutex;
    vex_util::Sparse2DArray m_array;
};

}  // namespace

void add_sparse(pybind11::module_& module) {
    py::class_<SparseBytes>(module, "SparseBytes")
        .def(py::init<std::size_t, std::size_t, std::size_t>())
        .def("insert", &SparseBytes::insert)
        .def("find", &SparseBytes::find)
        .def("remove", &SparseBytes::remove)
        .def("clear", &SparseBytes::clear)
        .def("select", &SparseBytes::select)
        .def("all", &SparseBytes::all);
}

}  // namespace basalt_python

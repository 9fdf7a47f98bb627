// Batches of cells of a sparse array. Elements are bytes here; the package's sparse.py gives them their
// dtype.
#include <pybind11/numpy.h>
#include <pybind11/pybind11.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <mutex>
#include <stdexcept>
#include <tuple>
#include <utility>
#include <vector>

#include "basalt/sparse.h"
#include "basalt/sparse_cells.h"
#include "universal.h"

namespace basalt_python {

namespace {

namespace py = pybind11;
using basalt::SparseCells;
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

    // Neighbours along a row are inserted in one call, which pays from a few on.
    void insert(const Cells& x, const Cells& y, const Bytes& elements) {
        check(x, y, elements.size());
        const auto [xs, ys, bytes] = std::tuple{x.data(), y.data(), elements.data()};
        const py::ssize_t count = x.size();
        exclusively([&] {
            std::uint8_t padded[LEAST_SIZE] = {};
            for (py::ssize_t i = 0, run = 0; i < count; i += run) {
                const std::uint8_t* element = bytes + static_cast<std::size_t>(i) * m_size;
                run = 1;
                while (i + run < count && ys[i + run] == ys[i] && xs[i + run] == xs[i] + run) {
                    ++run;
                }
                if (run >= 4) {
                    SparseCells::insert_row(m_array, xs[i], ys[i], element, m_size,
                                            static_cast<std::size_t>(run));
                    continue;
                }
                run = 1;
                if (m_size < LEAST_SIZE) {
                    element = static_cast<const std::uint8_t*>(std::memcpy(padded, element, m_size));
                }
                m_array.Insert(xs[i], ys[i], element);
            }
        });
    }

    // Elements, zero where there is none, and whether there is one.
    std::pair<Bytes, Flags> find(const Cells& x, const Cells& y) {
        check(x, y, x.size() * static_cast<py::ssize_t>(m_size));
        const auto count = static_cast<std::size_t>(x.size());
        Bytes elements(x.size() * static_cast<py::ssize_t>(m_size));
        Flags found(x.size());
        const auto [xs, ys] = std::pair{x.data(), y.data()};
        const auto [bytes, flags] = std::pair{elements.mutable_data(), found.mutable_data()};
        exclusively([&] {
            basalt::GridCell cells[BLOCK];
            void* at[BLOCK];
            for (std::size_t first = 0; first < count; first += BLOCK) {
                const std::size_t some = std::min(count - first, BLOCK);
                bool is_row = true;
                for (std::size_t i = 0; i < some; ++i) {
                    cells[i] = {xs[first + i], ys[first + i]};
                    is_row &= cells[i].y == cells[0].y &&
                              cells[i].x - std::int64_t{cells[0].x} == static_cast<std::int64_t>(i);
                }
                if (is_row) {
                    SparseCells::find_row(m_array, cells[0].x, cells[0].y, at, some);
                } else {
                    SparseCells::find(m_array, cells, at, some);
                }
                for (std::size_t i = 0; i < some; ++i) {
                    std::uint8_t* to = bytes + (first + i) * m_size;
                    flags[first + i] = at[i] != nullptr;
                    if (at[i] != nullptr) {
                        std::memcpy(to, at[i], m_size);
                    } else {
                        std::memset(to, 0, m_size);
                    }
                }
            }
        });
        return {std::move(elements), std::move(found)};
    }

    // Calls change(elements, found) and inserts the elements that it returns. Other threads wait.
    void update(const Cells& x, const Cells& y, const py::function& change) {
        const auto guard = locked();
        const auto [elements, found] = find(x, y);
        insert(x, y, change(elements, found).cast<Bytes>());
    }

    // Rows from y on, each of so many cells from x on.
    void insert_rows(std::int32_t x, std::int32_t y, std::size_t columns, const Bytes& elements) {
        const std::uint8_t* row = elements.data();
        const std::uint8_t* const end = row + elements.size();
        exclusively([&] {
            for (; row != end; row += columns * m_size) {
                SparseCells::insert_row(m_array, x, y++, row, m_size, columns);
            }
        });
    }

    // Copies into arrays of the caller; elements of empty cells are left as they are.
    void copy_rows(std::int32_t x, std::int32_t y, std::size_t columns, Bytes& elements, Flags& found) {
        std::uint8_t* row = elements.mutable_data();
        bool* flags = found.mutable_data();
        const bool* const end = flags + found.size();
        exclusively([&] {
            for (; flags != end; flags += columns, row += columns * m_size) {
                SparseCells::copy_row(m_array, x, y++, row, m_size, flags, columns);
            }
        });
    }

    // How many cells of a rectangle held an element.
    std::size_t remove_window(std::int32_t min_x, std::int32_t min_y, std::int32_t max_x,
                              std::int32_t max_y) {
        struct Context {
            vex_util::Sparse2DArray& array;
            std::size_t removed;
        } context{m_array, 0};
        const basalt::GridWindow window{min_x, min_y, max_x, max_y};
        const auto remove = [](const SparseCells::Row& row, void* at) {
            auto& [array, removed] = *static_cast<Context*>(at);
            const int first = __builtin_ctzll(row.wanted), end = 64 - __builtin_clzll(row.wanted);
            removed +=
                SparseCells::remove_row(array, row.x + first, row.y, static_cast<std::size_t>(end - first));
            return true;
        };
        exclusively([&] { SparseCells::visit(m_array, &window, remove, &context); });
        return context.removed;
    }

    std::size_t size() {
        std::size_t filled = 0;
        exclusively([&] { filled = SparseCells::size(m_array); });
        return filled;
    }

    Flags remove(const Cells& x, const Cells& y) {
        check(x, y, x.size() * static_cast<py::ssize_t>(m_size));
        Flags removed(x.size());
        const auto [xs, ys, flags] = std::tuple{x.data(), y.data(), removed.mutable_data()};
        const py::ssize_t count = x.size();
        exclusively([&] {
            for (py::ssize_t i = 0; i < count; ++i) {
                flags[i] = m_array.Remove(xs[i], ys[i]);
            }
        });
        return removed;
    }

    void clear() {
        exclusively([&] { m_array.RemoveAll(); });
    }

    using Selected =
        std::tuple<py::array_t<std::int32_t>, py::array_t<std::int32_t>, py::array_t<std::uint8_t>>;

    // Cells inside the rectangle, corners included.
    Selected select(std::int32_t min_x, std::int32_t min_y, std::int32_t max_x, std::int32_t max_y) {
        const basalt::GridWindow window{min_x, min_y, max_x, max_y};
        return visited(&window);
    }

    Selected all() { return visited(nullptr); }

private:
    static constexpr std::size_t LEAST_SIZE = 8;  // smallest element that the library stores

    struct Visited {
        std::size_t size;
        std::vector<std::int32_t> xs, ys;
        std::vector<std::uint8_t> bytes;
    };

    Selected visited(const basalt::GridWindow* window) {
        Visited cells{m_size, {}, {}, {}};
        exclusively([&] { SparseCells::visit(m_array, window, &collect, &cells); });
        return {array_of(std::move(cells.xs)), array_of(std::move(cells.ys)),
                array_of(std::move(cells.bytes))};
    }

    static bool collect(const SparseCells::Row& row, void* context) {
        auto& [size, xs, ys, bytes] = *static_cast<Visited*>(context);
        for (std::uint64_t left = *row.filled & row.wanted; left != 0; left &= left - 1) {
            const int i = __builtin_ctzll(left);
            xs.push_back(row.x + i);
            ys.push_back(row.y);
            const auto* element = static_cast<const std::uint8_t*>(row.elements[i]);
            bytes.insert(bytes.end(), element, element + size);
        }
        return true;
    }

    void check(const Cells& x, const Cells& y, py::ssize_t bytes) const {
        if (x.ndim() != 1 || y.ndim() != 1 || x.size() != y.size() ||
            bytes != x.size() * static_cast<py::ssize_t>(m_size)) {
            throw std::invalid_argument("x, y and elements differ in number");
        }
    }

    // The interpreter's lock is released before this one is taken, which avoids a deadlock.
    std::unique_lock<std::recursive_mutex> locked() {
        const py::gil_scoped_release others_run;
        return std::unique_lock(m_mutex);
    }

    // Runs a batch that other threads see as one step; the interpreter's lock is released.
    template <class Work>
    void exclusively(Work work) {
        const py::gil_scoped_release others_run;
        const std::lock_guard guard(m_mutex);
        work();
    }

    std::size_t m_size;
    std::recursive_mutex m_mutex;
    vex_util::Sparse2DArray m_array;
};

}  // namespace

void add_sparse(pybind11::module_& module) {
    py::class_<SparseBytes>(module, "SparseBytes")
        .def(py::init<std::size_t, std::size_t, std::size_t>())
        .def("insert", &SparseBytes::insert)
        .def("find", &SparseBytes::find)
        .def("remove", &SparseBytes::remove)
        .def("update", &SparseBytes::update)
        .def("insert_rows", &SparseBytes::insert_rows)
        .def("copy_rows", &SparseBytes::copy_rows, py::arg(), py::arg(), py::arg(), py::arg().noconvert(),
             py::arg().noconvert())
        .def("remove_window", &SparseBytes::remove_window)
        .def("size", &SparseBytes::size)
        .def("clear", &SparseBytes::clear)
        .def("select", &SparseBytes::select)
        .def("all", &SparseBytes::all);
}

}  // namespace basalt_python

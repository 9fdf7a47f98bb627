// Paths taken apart, and bytes as hexadecimal text.
#include <pybind11/pybind11.h>
#include <pybind11/stl.h>

#include <cstddef>
#include <cwchar>
#include <memory>
#include <stdexcept>
#include <string>
#include <tuple>
#include <vector>

#include "basalt/files.h"
#include "basalt/util/hex.h"
#include "universal.h"

namespace basalt_python {

namespace {

namespace py = pybind11;
using pybind11::literals::operator""_a;

// A path of Python: a str or an object with __fspath__. Bytes that are not UTF-8 are the surrogates 0xDC80 to
// 0xDCFF in it, as in the library; pybind11's own conversions refuse those.
CString wide(const py::object& path) {
    const py::object text = owned(PyOS_FSPath(path.ptr()));
    if (!py::isinstance<py::str>(text)) {
        throw py::type_error("expected a path as str, not bytes");
    }
    Py_ssize_t length = 0;
    const std::unique_ptr<wchar_t, decltype(&PyMem_Free)> characters(
        PyUnicode_AsWideCharString(text.ptr(), &length), &PyMem_Free);
    if (characters == nullptr) {
        throw py::error_already_set();
    }
    if (std::wcslen(characters.get()) != static_cast<std::size_t>(length)) {
        throw std::invalid_argument("the path contains a null character");
    }
    return CString(characters.get());
}

py::str plain(const CString& text) {
    return owned(PyUnicode_FromWideChar(text.GetString(), text.GetLength()));
}

// Runs work that reads the disk with the interpreter's lock released.
template <class Work>
auto without_lock(Work work) {
    const py::gil_scoped_release others_run;
    return work();
}

}  // namespace

void add_text(pybind11::module_& module) {
    module.def("split_path", [](const py::object& path) {
        const auto parts = without_lock([whole = wide(path)] { return vex_util::CFilePath(whole); });
        return std::tuple{plain(parts.Drive()), plain(parts.DirectoryOnly()), plain(parts.FileNameOnly()),
                          plain(parts.Extension())};
    });
    module.def("combine_path", [](const py::object& first, const py::object& second) {
        return plain(without_lock([a = wide(first), b = wide(second)] {
            vex_util::CFilePath path;
            path.Combine(a, b);
            return path;
        }));
    });
    module.def("set_extension", [](const py::object& path, const py::object& extension) {
        return plain(without_lock([whole = wide(path), last = wide(extension)] {
            vex_util::CFilePath parts(whole);
            parts.SetExtension(last);
            return parts;
        }));
    });
    module.def("files_in_directory", [](const py::object& directory, const py::object& pattern) {
        const auto found = without_lock([whole = wide(directory), chosen = wide(pattern)] {
            return vex_util::CFilePath(whole).GetFilesInDirectory(chosen);
        });
        py::list names;
        for (const CString& name : found) {
            names.append(plain(name));
        }
        return names;
    });

    module.def(
        "bytes_to_hex",
        [](const py::bytes& bytes) { return basalt::StringToHexString(static_cast<std::string>(bytes)); },
        "bytes"_a, "Two lower-case digits a byte (basalt::StringToHexString).");
    module.def(
        "hex_to_bytes",
        [](const std::string& text) {
            if (text.size() % 2 != 0 || !basalt::IsHexString(text)) {
                throw std::invalid_argument("expected pairs of hexadecimal digits");
            }
            const std::vector<unsigned char> bytes = basalt::HexStringToVector(text);
            return py::bytes(reinterpret_cast<const char*>(bytes.data()), bytes.size());
        },
        "text"_a, "Bytes of digits in either case; ValueError for other text (basalt::HexStringToVector).");
}

}  // namespace basalt_python

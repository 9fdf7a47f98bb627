// Paths taken apart, and bytes as hexadecimal text.
#include <pybind11/pybind11.h>
#include <pybind11/stl.h>

#include <cstdint>
#include <string>
#include <tuple>
#include <vector>

#include "basalt/files.h"
#include "basalt/util/hex.h"
#include "universal.h"

namespace basalt_python {

namespace {

namespace py = pybind11;

CString wide(const std::wstring& text) {
    if (text.find(L'\0') != std::wstring::npos) {
        throw std::invalid_argument("a zero in a path");
    }
    return CString(text.c_str());
}

std::wstring plain(const CString& text) {
    return text.GetString();
}

}  // namespace

void add_text(pybind11::module_& module) {
    module.def("split_path", [](const std::wstring& path) {
        const vex_util::CFilePath parts(wide(path));
        return std::tuple{plain(parts.Drive()), plain(parts.DirectoryOnly()), plain(parts.FileNameOnly()),
                          plain(parts.Extension())};
    });
    module.def("combine_path", [](const std::wstring& first, const std::wstring& second) {
        vex_util::CFilePath path;
        path.Combine(wide(first), wide(second));
        return plain(path);
    });
    module.def("set_extension", [](const std::wstring& path, const std::wstring& extension) {
        vex_util::CFilePath parts(wide(path));
        parts.SetExtension(wide(extension));
        return plain(parts);
    });
    module.def("files_in_directory", [](const std::wstring& directory, const std::wstring& pattern) {
        vex_util::CFilePath path(wide(directory));
        std::vector<CString> found;
        {
            const py::gil_scoped_release others_run;
            found = path.GetFilesInDirectory(wide(pattern));
        }
        std::vector<std::wstring> names;
        for (const CString& name : found) {
            names.push_back(plain(name));
        }
        return names;
    });

    module.def("bytes_to_hex", [](const py::bytes& bytes) {
        return basalt::StringToHexString(static_cast<std::string>(bytes));
    });
    module.def("hex_to_bytes", [](const std::string& text) {
        if (text.size() % 2 != 0 || !basalt::IsHexString(text)) {
            throw std::invalid_argument("pairs of hexadecimal digits are wanted");
        }
        const std::vector<unsigned char> bytes = basalt::HexStringToVector(text);
        return py::bytes(reinterpret_cast<const char*>(bytes.data()), bytes.size());
    });
}

}  // namespace basalt_python

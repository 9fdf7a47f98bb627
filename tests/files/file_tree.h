// A folder of files for a test.
#ifndef BASALT_TESTS_FILES_FILE_TREE_H
#define BASALT_TESTS_FILES_FILE_TREE_H

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>

#include "basalt/platform/cstring.h"
#include "src/platform/text/utf8.h"
#include "tests/support/scratch_folder.h"

inline CString text(const std::wstring& characters) {
    return CString(characters.c_str(), static_cast<int>(characters.size()));
}

// A folder of its own for each test, named in the wide form that the classes take.
struct FileTree : testing::Test {
    void make_file(const std::string& name) const { std::ofstream(root / name) << "x"; }
    CString at(const std::wstring& name) const { return text(wide_root + L"/" + name); }

    const basalt::test::ScratchFolder scratch;
    const std::filesystem::path root = std::filesystem::canonical(scratch.path());
    const std::wstring wide_root = basalt::platform::wide_from_utf8(root.string());
};

#endif

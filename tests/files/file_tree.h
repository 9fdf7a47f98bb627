// A folder of files for a test.
#ifndef BASALT_TESTS_FILES_FILE_TREE_H
#define BASALT_TESTS_FILES_FILE_TREE_H

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <random>
#include <string>

#include "basalt/platform/cstring.h"
#include "src/platform/utf8.h"

inline CString text(const std::wstring& characters) {
    return CString(characters.c_str(), static_cast<int>(characters.size()));
}

// A folder of its own for each test, named in the wide form that the classes take.
struct FileTree : testing::Test {
    FileTree()
        : root(std::filesystem::canonical(std::filesystem::temp_directory_path()) /
               ("basalt_files_" + std::to_string(std::random_device{}()))),
          wide_root(basalt::platform::wide_from_utf8(root.string())) {
        std::filesystem::create_directory(root);
    }
    ~FileTree() override { std::filesystem::remove_all(root); }

    void make_file(const std::string& name) const { std::ofstream(root / name) << "x"; }
    CString at(const std::wstring& name) const { return text(wide_root + L"/" + name); }

    std::filesystem::path root;
    std::wstring wide_root;
};

#endif

#include "basalt/memory/memory_map.h"

#include <algorithm>
#include <cstdlib>
#include <exception>

#include "basalt/frame.h"
#include "basalt/platform/cstring.h"
#include "basalt/platform/error.h"
#include "src/platform/file.h"
#include "src/platform/file_mapping.h"
#include "src/platform/file_search.h"

namespace vex_util {
namespace {

constexpr int LONGEST_NAME = 259;  // characters
constexpr int NUMBERS = 65'535;    // that can be drawn, from 0
constexpr int DRAWS = 1000;        // then all numbers in turn, so that the last free one is found

// The full name of a number's file in the current temporary folder; empty without a folder or when it is too
// long.
CString file_name(std::uint16_t number) {
    const CString folder = _tempFilePath();
    CString name;
    if (!folder.IsEmpty()) {
        name.Format(L"%s\\~%07i.mem", folder, number);
    }
    return name.GetLength() <= LONGEST_NAME ? name : CString();
}

// A new file, opened exclusively and deleted when closed, and the number in its name; INVALID_HANDLE_VALUE on
// failure.
HANDLE create_file(std::uint16_t& number) {
    HANDLE file = INVALID_HANDLE_VALUE;
    DWORD error = ERROR_FILE_EXISTS;
    for (int tried = 0; tried < DRAWS + NUMBERS && error == ERROR_FILE_EXISTS; ++tried) {
        number = tried < DRAWS ? _random_uint16() : static_cast<std::uint16_t>((number + 1) % NUMBERS);
        const CString name = file_name(number);
        if (name.IsEmpty()) {
            return INVALID_HANDLE_VALUE;
        }
        file = CreateFileW(name, GENERIC_READ | GENERIC_WRITE, 0, nullptr, CREATE_NEW,
                           FILE_ATTRIBUTE_HIDDEN | FILE_FLAG_DELETE_ON_CLOSE, nullptr);
        error = file != INVALID_HANDLE_VALUE ? ERROR_SUCCESS : GetLastError();
    }
    return file;
}

// Deletes a number's file in the current temporary folder unless it is open.
void delete_by_number(std::uint16_t number) {
    try {
        const CString name = file_name(number);
        if (!name.IsEmpty()) {
            DeleteFileW(name);
        }
    } catch (const std::exception&) {
        // Out of memory: CleanUp() deletes the file, if there is one.
    }
}

// Closes a search at the end of its scope.
struct SearchEnd {
    HANDLE search;
    explicit SearchEnd(HANDLE begun) : search(begun) {}
    ~SearchEnd() { FindClose(search); }
    SearchEnd(const SearchEnd&) = delete;
    SearchEnd& operator=(const SearchEnd&) = delete;
};

}  // namespace

CMemoryMap::CMemoryMap()
    : m_data(nullptr), m_size(0), m_file(INVALID_HANDLE_VALUE), m_mapping(nullptr), m_number(0) {}

CMemoryMap::CMemoryMap(unsigned long size) : CMemoryMap() {
    Create(size);
}

CMemoryMap::~CMemoryMap() {
    Destroy();
}

bool CMemoryMap::Create(unsigned long size) {
    Destroy();
    if (size > UINT32_MAX) {
        return false;
    }
    m_size = static_cast<std::uint32_t>(size);
    if (create_on_file()) {
        return true;
    }
    Destroy();
    // Zeroed like a new file, and like it without touching the pages.
    m_data = std::calloc(std::max(m_size, std::uint32_t{1}), 1);
    return m_data != nullptr;
}

// On failure Destroy() releases what has been made so far.
bool CMemoryMap::create_on_file() {
    try {
        m_file = create_file(m_number);
    } catch (const std::exception&) {
        return false;  // out of memory for the name
    }
    if (m_file == INVALID_HANDLE_VALUE) {
        return false;
    }
    m_mapping = CreateFileMappingW(m_file, nullptr, PAGE_READWRITE, 0, m_size, nullptr);
    if (m_mapping == nullptr) {
        return false;
    }
    m_data = MapViewOfFile(m_mapping, FILE_MAP_ALL_ACCESS, 0, 0, m_size);
    return m_data != nullptr;
}

bool CMemoryMap::Destroy() {
    if (m_data != nullptr) {
        if (m_mapping != nullptr) {
            UnmapViewOfFile(m_data);
        } else {
            std::free(m_data);
        }
        m_data = nullptr;
    }
    if (m_mapping != nullptr) {
        CloseHandle(m_mapping);
        m_mapping = nullptr;
    }
    if (m_file != INVALID_HANDLE_VALUE) {
        // Closing deletes the file by its original path. A file of its name in the current folder that is not
        // open is stale.
        CloseHandle(m_file);
        m_file = INVALID_HANDLE_VALUE;
        delete_by_number(m_number);
    }
    return true;
}

CMemoryMap::operator void*() const {
    return m_data;
}

void CMemoryMap::CleanUp() {
    try {
        const CString folder = _tempFilePath();
        if (folder.IsEmpty()) {
            return;
        }
        WIN32_FIND_DATAW entry;
        const HANDLE search = FindFirstFileW(folder + L"\\~*.mem", &entry);
        if (search == INVALID_HANDLE_VALUE) {
            return;
        }
        const SearchEnd end(search);
        do {
            DeleteFileW(folder + L"\\" + entry.cFileName);
        } while (FindNextFileW(search, &entry) != 0);
    } catch (const std::exception&) {
        // Out of memory for the names: the files stay until the next call.
    }
}

}  // namespace vex_util

#include <new>

#include "basalt/files.h"
#include "basalt/platform/error.h"
#include "src/files/handle_scoper.h"
#include "src/platform/file.h"
#include "src/platform/file_search.h"
#include "src/platform/path_split.h"

namespace {

using basalt::platform::first_match_attributes;
using basalt::platform::is_separator;
using SearchScoper = HANDLEScoperBase<FindFileHandleCloser>;

// After a failed search: being out of memory is not the same as finding no entry.
void throw_if_out_of_memory() {
    if (GetLastError() == ERROR_NOT_ENOUGH_MEMORY) {
        throw std::bad_alloc();
    }
}

// 0 when there is no entry.
DWORD entry_attributes(const CString& path) {
    const DWORD attributes = first_match_attributes(path);
    if (attributes == 0) {
        throw_if_out_of_memory();
    }
    return attributes;
}

HANDLE find_first(const CString& path, WIN32_FIND_DATAW& entry) {
    const HANDLE search = FindFirstFileW(path, &entry);
    if (search == INVALID_HANDLE_VALUE) {
        throw_if_out_of_memory();
        return nullptr;
    }
    return search;
}

// A time of the second match, or of the only one. False when there is none.
bool find_time(const CString& path, FILETIME WIN32_FIND_DATAW::*which, FILETIME& time) {
    WIN32_FIND_DATAW entry;
    const SearchScoper search(find_first(path, entry));
    if (!search.is_open()) {
        return false;
    }
    if (FindNextFileW(search.get(), &entry) == 0) {
        throw_if_out_of_memory();
    }
    time = entry.*which;
    return true;
}

CString joined(const CString& first, const CString& second) {
    return first + L'\\' + second;
}

// Without its first and last separator.
std::wstring_view trimmed(std::wstring_view directory) {
    if (!directory.empty() && is_separator(directory.back())) {
        directory.remove_suffix(1);
    }
    if (!directory.empty() && is_separator(directory.front())) {
        directory.remove_prefix(1);
    }
    return directory;
}

// Reuses the text's storage, so setting a path again does not allocate.
void assign(CString& text, std::wstring_view characters) {
    const auto length = static_cast<int>(characters.size());
    characters.copy(text.GetBuffer(length), characters.size());
    text.ReleaseBuffer(length);
}

}  // namespace

namespace vex_util {

CFilePath::CFilePath() = default;

// NOLINTNEXTLINE(modernize-pass-by-value): the interface's signature
CFilePath::CFilePath(const CString& path) : m_full_path(path) {
    split();
}

CFilePath& CFilePath::operator=(CString& path) {
    m_full_path = path;
    split();
    return *this;
}

void CFilePath::split() {
    if (m_full_path.IsEmpty()) {
        return;
    }
    basalt::platform::PathParts parts;
    const bool is_split = split_path(m_full_path.GetString(), parts);
    assign(m_drive, parts.drive);
    assign(m_directory_only, trimmed(parts.directory));
    assign(m_file_name_only, parts.name);
    assign(m_extension, parts.extension.substr(parts.extension.empty() ? 0 : 1));
    if (is_split && IsDirectory(m_full_path)) {
        assign(m_file_name_only, {parts.name.data(), parts.name.size() + parts.extension.size()});
        m_directory_only = joined(m_directory_only, m_file_name_only);
        m_file_name_only.Empty();
    }
}

void CFilePath::Combine(const CString& first, const CString& second) {
    // The arguments may be members. Each up to its first zero, as "%s" takes it.
    m_full_path = CString(first.GetString()) + L'\\' + second.GetString();
    split();
}

const CString& CFilePath::Drive() const {
    return m_drive;
}

CString CFilePath::Directory() const {
    return joined(m_drive, m_directory_only);
}

const CString& CFilePath::DirectoryOnly() const {
    return m_directory_only;
}

CString CFilePath::FileName() const {
    const bool has_both = !m_file_name_only.IsEmpty() && !m_extension.IsEmpty();
    return has_both ? m_file_name_only + L'.' + m_extension : CString();
}

const CString& CFilePath::FileNameOnly() const {
    return m_file_name_only;
}

const CString& CFilePath::Extension() const {
    return m_extension;
}

void CFilePath::SetExtension(const CString& extension) {
    m_extension = extension;
    Combine(Directory(), FileName());
}

bool CFilePath::FileExists() const {
    return FileExists(m_full_path);
}

bool CFilePath::IsFile() const {
    return FileExists();
}

bool CFilePath::IsDirectory() const {
    return IsDirectory(m_full_path);
}

FILETIME CFilePath::GetCreationTime() const {
    FILETIME time{};
    GetFileCreationTime(m_full_path, time);
    return time;
}

FILETIME CFilePath::GetLastAccessTime() const {
    FILETIME time{};
    GetLastAccessTime(m_full_path, time);
    return time;
}

bool CFilePath::FileExists(const CString& path) {
    const DWORD attributes = entry_attributes(path);
    return attributes != 0 && (attributes & FILE_ATTRIBUTE_DIRECTORY) == 0;
}

bool CFilePath::IsDirectory(const CString& path) {
    return (entry_attributes(path) & FILE_ATTRIBUTE_DIRECTORY) != 0;
}

bool CFilePath::GetFileCreationTime(const CString& path, FILETIME& time) {
    return find_time(path, &WIN32_FIND_DATAW::ftCreationTime, time);
}

bool CFilePath::GetLastAccessTime(const CString& path, FILETIME& time) {
    return find_time(path, &WIN32_FIND_DATAW::ftLastAccessTime, time);
}

// NOLINTNEXTLINE(readability-make-member-function-const): the interface's signature
std::vector<CString> CFilePath::GetFilesInDirectory(const CString& pattern) {
    std::vector<CString> files;
    const CString prefix = Directory() + L'\\';
    basalt::platform::for_each_match(prefix + pattern, [&](const wchar_t* name) {
        CString& file = files.emplace_back(prefix);
        file += name;
    });
    return files;
}

}  // namespace vex_util

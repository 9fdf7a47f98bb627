/// @file
/// Paths: one split and kept in step with the disk, and one split once.
///
/// Both split at `\` and `/` alike and compose with `\`; the system gets `/` for either. A drive letter is a
/// name like any other here. File names are UTF-8 on the disk whatever the locale; bytes that are not are
/// listed as the values 0xDC80 to 0xDCFF, a `\` within a name as 0xDC5C, and lead back to the same file.
/// Only std::bad_alloc and std::length_error (more than 2^31 - 1 characters) are thrown.
#ifndef BASALT_FILES_H
#define BASALT_FILES_H

#include <type_traits>
#include <vector>

#include "basalt/export.h"
#include "basalt/platform/calendar.h"
#include "basalt/platform/cstring.h"

namespace vex_util {

/// A path with its parts: for `C:\data\job.tar.gz` the drive `C:`, the directory `data`, the name `job.tar`
/// and the extension `gz`. When the path names an existing directory, its whole last element belongs to the
/// directory part and the name is empty; the extension is still the text after the last dot. So every change
/// of the path costs a system call.
///
/// Existence, kind and times come from a search for the path: with `*` or `?` in its last element it matches
/// any entry of the folder, `.` and `..` included, in the system's order; an empty path and one that ends in
/// a separator match nothing. A link counts as its target, or as a file if that is missing; everything that
/// is not a directory, pipes and devices too, is a file, and nothing is ever opened. Threads: reentrant; one
/// object is used by one thread at a time, or by many for reading. The static functions are thread-safe.
class BASALT_API CFilePath {
public:
    /// The empty path, all parts empty.
    CFilePath();
    /// A path, split. If a part is longer than 255 characters (the directory counts its last separator, the
    /// extension its dot), all parts are empty; the path itself is kept.
    CFilePath(const CString& path);
    /// Sets the path, as the constructor does; the empty path leaves the parts unchanged.
    CFilePath& operator=(CString& path);
    /// The same for a temporary or a constant.
    template <class Text, std::enable_if_t<std::is_same_v<Text, CString>, int> = 0>
    CFilePath& operator=(const Text& path) {
        return *this = const_cast<CString&>(path);  // which is only read
    }
    /// The path as it was set.
    operator const CString&() const { return m_full_path; }
    /// Sets the path to `first`, `\` and `second`, whatever they end and begin with, each up to its first
    /// zero; they may be parts of the object itself.
    void Combine(const CString& first, const CString& second);

    /// @name Parts
    /// @{

    /// The drive: a letter and a colon, or empty.
    const CString& Drive() const;
    /// Drive, `\` and directory, also if either is empty: `\data` for the relative path `data\job.txt`, `\`
    /// for `job.txt`, `C:\\data` for an existing directory `C:\data`.
    CString Directory() const;
    /// The directory without its first and last separator.
    const CString& DirectoryOnly() const;
    /// Name, `.` and extension; empty if either is empty.
    CString FileName() const;
    /// The name without its extension.
    const CString& FileNameOnly() const;
    /// The extension without its dot; `.profile` has no name, only an extension.
    const CString& Extension() const;
    /// Stores the extension as given (a leading dot is kept and doubles) and combines Directory() and
    /// FileName(). An empty extension loses the name; a path without a name becomes its directory and a
    /// separator.
    void SetExtension(const CString& extension);
    /// @}

    /// @name Queries of the disk
    /// @{

    /// Whether there is a file of this path; of the first match for a path with wildcards.
    bool FileExists() const;
    /// The same as FileExists().
    bool IsFile() const;
    /// Whether there is a directory of this path; of the first match for a path with wildcards.
    bool IsDirectory() const;
    /// Creation time of the entry, or the time of its last change where the file system keeps none; all zero
    /// if there is no entry or its folder may be read but not entered. Clamped to the years 1601 to 30828.
    /// For a path with wildcards that of the second match, or of the only one.
    FILETIME GetCreationTime() const;
    /// Time of the last access, in the same way.
    FILETIME GetLastAccessTime() const;
    /// FileExists() of any path.
    static bool FileExists(const CString& path);
    /// IsDirectory() of any path.
    static bool IsDirectory(const CString& path);
    /// GetCreationTime() of any path. False, and the time unchanged, if there is no entry.
    static bool GetFileCreationTime(const CString& path, FILETIME& time);
    /// GetLastAccessTime() of any path. False, and the time unchanged, if there is no entry.
    static bool GetLastAccessTime(const CString& path, FILETIME& time);
    /// The entries of Directory() that match a pattern, each behind Directory() and a backslash, in the
    /// system's order: subdirectories, the folder itself and its parent too. For a relative path that is a
    /// folder of the root, for a path with a part longer than 255 characters the root.
    /// @param pattern an asterisk for any characters, a question mark for one; case-sensitive; two asterisks
    /// with a dot between match everything
    std::vector<CString> GetFilesInDirectory(const CString& pattern);
    /// @}

private:
    BASALT_LOCAL void split();

    CString m_full_path;
    CString m_drive;
    CString m_directory_only;
    CString m_file_name_only;
    CString m_extension;
};

/// A path split at construction, without access to the disk, and its parts in any combination. They keep
/// every separator and dot: joined they are the path. Threads: one object is used by one thread at a time,
/// even for reading.
class BASALT_API Path {
public:
    /// Splits a path. The empty path, and one with a part longer than 255 characters (the directory counts
    /// its last separator, the extension its dot), has only empty parts.
    Path(const CString& path);
    /// Copies parts and last combination.
    Path(const Path& other);
    /// Copies parts and last combination.
    Path& operator=(const Path& other);
    ~Path();

    /// The selected parts, joined in their order.
    /// @param selector sum of 1 (drive), 2 (directory), 4 (name) and 8 (extension); other bits are ignored
    /// @return the text, valid until the next call, an assignment or the destruction
    const CString& GetPath(unsigned char selector) const;
    /// The selected parts of any path. Threads: thread-safe.
    static CString GetPath(const CString& path, unsigned char selector);

private:
    static constexpr int PARTS = 4;

    mutable CString m_result;
    CString m_path;
    int m_bounds[PARTS + 1] = {};  // where in the path each part begins, and the last ends
};

}  // namespace vex_util

#endif

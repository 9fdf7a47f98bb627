/// @file
/// Paths: one taken apart and kept in step with the disk, and one taken apart for good.
///
/// Both split at `\` and `/` alike; what they compose has `\`, and the system is given `/` for either. A
/// drive letter is a name like any other here. File names are UTF-8 on the disk whatever the locale; bytes
/// that are not are listed as the values 0xDC80 to 0xDCFF, a `\` within a name as 0xDC5C, and lead back to
/// the same file. Nothing throws but std::bad_alloc and std::length_error, for want of memory or length.
#ifndef BASALT_FILES_H
#define BASALT_FILES_H

#include <vector>

#include "basalt/export.h"
#include "basalt/platform/calendar.h"
#include "basalt/platform/cstring.h"

namespace vex_util {

/// A path with its parts: for `C:\data\job.tar.gz` the drive `C:`, the directory `data`, the name `job.tar`
/// and the extension `gz`. When the path names an existing directory, that directory's name belongs to the
/// directory part (its extension stays the extension) and the name is empty. So every change of the path asks
/// the disk once.
///
/// The disk is asked by a search for the path as it stands: with `*` or `?` in its last element it matches
/// any entry of the folder, `.` and `..` among them, in the system's order; a path that is empty or ends in a
/// separator is nothing. Links answer for what they lead to, or for themselves where that is nothing;
/// whatever is no directory, a pipe or a device too, is a file, and nothing is ever opened. Threads:
/// reentrant; one object is used by one thread at a time, or by many for reading. The static functions are
/// thread-safe.
class BASALT_API CFilePath {
public:
    /// The empty path, all parts empty.
    CFilePath();
    /// A path, split. Should a part be longer than 255 characters (those of the directory and extension
    /// count a separator and the dot), all parts are empty; the path itself is kept.
    CFilePath(const CString& path);
    /// Sets the path, as constructed; the empty path leaves the parts as they were.
    CFilePath& operator=(CString& path);
    /// The path as it was set.
    operator const CString&() const { return m_full_path; }
    /// Sets the path to `first`, `\` and `second`, whatever they end and begin with, each up to its first
    /// zero; they may be parts of the object itself.
    void Combine(const CString& first, const CString& second);

    /// @name Parts
    /// @{

    /// The drive: a letter and a colon, or empty.
    const CString& Drive() const;
    /// Drive, `\` and directory, also where either is empty: `\data` for the relative path `data\job.txt`,
    /// `\` for `job.txt`, `C:\\data` for an existing directory `C:\data`.
    CString Directory() const;
    /// The directory without its first and last separator.
    const CString& DirectoryOnly() const;
    /// Name, `.` and extension; empty when either is empty.
    CString FileName() const;
    /// The name without its extension.
    const CString& FileNameOnly() const;
    /// The extension without its dot; all of `.profile` is extension.
    const CString& Extension() const;
    /// Stores the extension as given (a dot at its front stays and doubles) and combines Directory() and
    /// FileName(). An empty extension loses the name, and a path without a name gets none: its directory and
    /// a separator are left.
    void SetExtension(const CString& extension);
    /// @}

    /// @name Questions to the disk
    /// @{

    /// Whether there is a file of this path. A wildcard path asks for its first match.
    bool FileExists() const;
    /// What FileExists() gives.
    bool IsFile() const;
    /// Whether there is a directory of this path. A wildcard path asks for its first match.
    bool IsDirectory() const;
    /// When the entry of this path was made, where the file system knows it, or else last changed; all zero
    /// when there is none, or it lies in a folder that may be read but not entered. Times before 1601 and
    /// after 30828 are brought to those years. A wildcard path asks for its second match, or the only one.
    FILETIME GetCreationTime() const;
    /// When the entry of this path was last read, in the same way.
    FILETIME GetLastAccessTime() const;
    /// FileExists() of any path.
    static bool FileExists(const CString& path);
    /// IsDirectory() of any path.
    static bool IsDirectory(const CString& path);
    /// GetCreationTime() of any path. False, with the time untouched, when there is no entry.
    static bool GetFileCreationTime(const CString& path, FILETIME& time);
    /// GetLastAccessTime() of any path. False, with the time untouched, when there is no entry.
    static bool GetLastAccessTime(const CString& path, FILETIME& time);
    /// The entries of Directory() that match a pattern, each behind Directory() and a backslash, in the
    /// system's order: subdirectories, the folder itself and the one above it too. For a relative path
    /// that is a folder of the root; for a path with a part too long to split it is the root itself.
    /// @param pattern an asterisk for any characters, a question mark for one; case counts, and two asterisks
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

/// A path taken apart at construction, without a look at the disk, and its parts in any combination. They
/// keep every separator and dot: joined they are the path. Threads: one object is used by one thread at a
/// time, for reading too.
class BASALT_API Path {
public:
    /// Splits a path. The empty path, and one with a part (the directory with its last separator, the
    /// extension with its dot) of more than 255 characters, has only empty parts.
    Path(const CString& path);
    /// Copies parts and last combination.
    Path(const Path& other);
    /// Copies parts and last combination.
    Path& operator=(const Path& other);
    ~Path();

    /// The selected parts, joined in their order.
    /// @param selector sum of 1 (drive), 2 (directory), 4 (name) and 8 (extension); other bits are ignored
    /// @return the text, which the next call, an assignment and the destruction overwrite
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

/// @file
/// The running program's version numbers and descriptive texts.
#ifndef BASALT_UTIL_VERSION_INFO_H
#define BASALT_UTIL_VERSION_INFO_H

#include <vector>

#include "basalt/export.h"
#include "basalt/platform/cstring.h"
#include "basalt/platform/types.h"

/// The version resource of the running program's file. The CMake function basalt_add_version_resource() of
/// the installed package puts one into a program.
///
/// A new object is version 1.0.0.1 with empty texts.
/// Bad input: every length and offset in a resource is checked before it is used; what is valid is read.
/// Threads: one object is used by one thread at a time, or by many for reading.
class BASALT_API VersionInfo {
public:
    /// Version 1.0.0.1, empty texts.
    VersionInfo();

    /// Reads the resource of the process's executable: four numbers from the product version of its fixed
    /// information (not from the file version or a text), and six texts in the language that its translation
    /// table lists first. Without fixed information the numbers are unchanged, without a translation the
    /// texts; with one, a text that is missing becomes empty.
    /// @param instance ignored
    /// @return false, and everything unchanged, if the file cannot be read or has no resource, if its name
    /// has more than 255 characters, or when out of memory
    bool InitVersionInfo(HINSTANCE instance);

    /// First part of the product version.
    int GetMajorVersion();
    /// Second part of the product version.
    int GetMinorVersion();
    /// Third part of the product version.
    int GetSchemaVersion();
    /// Fourth part of the product version.
    int GetBuild();

    /// "ProductName".
    CString GetProductName();
    /// "InternalName".
    CString GetInternalName();
    /// "LegalCopyright".
    CString GetCopyright();
    /// "ProductVersion", the text.
    CString GetProductVersion();
    /// "FileDescription".
    CString GetFileDescription();
    /// "Comment".
    CString GetComment();

    /// The product name, a blank and the four numbers, each with at least two digits: "Survey 04.01.02.305".
    CString GetVersionString();

private:
    int m_major = 1;
    int m_minor = 0;
    int m_schema = 0;
    int m_build = 1;
    CString m_product_name;
    CString m_internal_name;
    CString m_copyright;
    CString m_product_version;
    CString m_file_description;
    CString m_comment;
    std::vector<BYTE> m_version_data;
    CString m_translation;  // language and code page, eight hexadecimal digits
};

#endif

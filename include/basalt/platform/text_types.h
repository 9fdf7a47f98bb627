/// @file
/// Win32 names of text types: text is wide.
///
/// unixODBC's sql.h gives some of these names to other types. A host that needs both includes sql.h first;
/// this header then leaves those names out.
#ifndef BASALT_PLATFORM_TEXT_TYPES_H
#define BASALT_PLATFORM_TEXT_TYPES_H

/// Wide text that is only read.
using LPCTSTR = const wchar_t*;
/// Bytes that are only read.
using LPCSTR = const char*;
/// Bytes.
using LPSTR = char*;

#ifndef __SQLTYPES_H
/// A character.
using TCHAR = wchar_t;
/// A wide character.
using WCHAR = wchar_t;
/// Wide text.
using LPTSTR = wchar_t*;
/// Wide text.
using LPWSTR = wchar_t*;
/// Wide text that is only read.
using LPCWSTR = const wchar_t*;
#endif

#ifndef _T
/// A literal as wide text.
#define _T(text) L##text  // NOLINT(bugprone-reserved-identifier): the Win32 name
#endif

#endif

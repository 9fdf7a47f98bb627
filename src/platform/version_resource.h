// Version resources: a standard block in a section of a program's file, and the values in it.
//
// The block is a tree of nodes. Each begins with three little-endian words (its length, its value's length
// and whether the value is text) and a UTF-16 key; value and child nodes follow, each at a multiple of 4
// bytes from the block's start. The root's value is the fixed information; below it stand
//   StringFileInfo \ <language and code page, 8 hexadecimal digits> \ <key>   a text
//   VarFileInfo \ Translation                                                 pairs of language and code page
// A file may hold anything: no length or offset is used before it is known to lie within what holds it, and
// every search ends after at most a block's length of steps.
#ifndef BASALT_SRC_PLATFORM_VERSION_RESOURCE_H
#define BASALT_SRC_PLATFORM_VERSION_RESOURCE_H

#include <string>

#include "basalt/platform/types.h"

// Name of the section. cmake/version_resource.cpp.in puts the block there.
inline constexpr char VERSION_RESOURCE_SECTION[] = ".version_resource";

// The published record.
struct VS_FIXEDFILEINFO {
    DWORD dwSignature;
    DWORD dwStrucVersion;
    DWORD dwFileVersionMS;
    DWORD dwFileVersionLS;
    DWORD dwProductVersionMS;
    DWORD dwProductVersionLS;
    DWORD dwFileFlagsMask;
    DWORD dwFileFlags;
    DWORD dwFileOS;
    DWORD dwFileType;
    DWORD dwFileSubtype;
    DWORD dwFileDateMS;
    DWORD dwFileDateLS;
};
static_assert(sizeof(VS_FIXEDFILEINFO) == 52);

// Bytes of a file's version resource. `handle` is set to 0 when it is not null.
// Failure: 0, with ERROR_RESOURCE_DATA_NOT_FOUND for a file that is no program of this system, has no such
// section or is shorter than it claims, and for a block that claims to be longer than its section;
// ERROR_NOT_ENOUGH_MEMORY. Threads: thread-safe.
DWORD GetFileVersionInfoSizeW(const wchar_t* file, DWORD* handle);

// Reads a file's version resource into `data`, which has room for `length` bytes. `handle` is ignored.
// Failure: 0, with ERROR_INSUFFICIENT_BUFFER when it needs more, or as above.
// Threads: thread-safe.
BOOL GetFileVersionInfoW(const wchar_t* file, DWORD handle, DWORD length, void* data);

// Finds a value in a version resource, which has at least as many bytes as its first word says.
// `path` is a backslash for the fixed information, or the keys on the way, each after a backslash, in either
// case. Of several nodes of one name the first counts.
// `value` is set to where it stands in the block, at any alignment, and `length` to its size: in bytes, or
// for a text in 16-bit units up to the end claimed for it, which may lie behind its terminator. Failure: 0
// with ERROR_RESOURCE_TYPE_NOT_FOUND, value and length as they were: no such node, one that does not lie
// within its parent, or a root whose value is not the fixed information. Threads: reentrant.
BOOL VerQueryValueW(const void* block, const wchar_t* path, void** value, UINT* length);

namespace basalt::platform {

// Text of little-endian UTF-16 at any alignment, up to its terminator or `length` units;
// REPLACEMENT_CHARACTER for half a pair.
std::wstring wide_from_utf16(const void* units, std::size_t length);

}  // namespace basalt::platform

#endif

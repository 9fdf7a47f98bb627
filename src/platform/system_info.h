// The operating system's version, the running program's file and its version resource, network interfaces.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_INFO_H
#define BASALT_SRC_PLATFORM_SYSTEM_INFO_H

#include <cstddef>
#include <string>

#include "basalt/platform/types.h"

// ---- Operating system ----

// As in Win32; the text has 16-bit characters on every system.
struct OSVERSIONINFOW {
    DWORD dwOSVersionInfoSize;
    DWORD dwMajorVersion;
    DWORD dwMinorVersion;
    DWORD dwBuildNumber;
    DWORD dwPlatformId;
    char16_t szCSDVersion[128];
};
static_assert(sizeof(OSVERSIONINFOW) == 276);

inline constexpr DWORD VER_PLATFORM_WIN32s = 0;
inline constexpr DWORD VER_PLATFORM_WIN32_WINDOWS = 1;
inline constexpr DWORD VER_PLATFORM_WIN32_NT = 2;

// Fills the version record, whose size field the caller has set to 276: release 6.2 of the NT family, the
// highest that the library distinguishes. 1. Threads: reentrant.
BOOL GetVersionExW(OSVERSIONINFOW* information);

// ---- Executable ----

// Full name of the file that the running program was started from; " (deleted)" follows if that was replaced
// or deleted since. `module` is null; `name` has space for `size` characters, the terminator included, at
// least one. Returns the length without the terminator. A longer name is truncated to `size` - 1 characters
// and the result is `size` with ERROR_INSUFFICIENT_BUFFER. 0 on failure: ERROR_NOT_ENOUGH_MEMORY and other
// errors of the system. Threads: thread-safe.
DWORD GetModuleFileNameW(HINSTANCE module, wchar_t* name, DWORD size);

// ---- Version resource ----
//
// A standard block in a section of the program's file: a tree of nodes, each with three little-endian words
// (its length, its value's length, whether the value is text) and a UTF-16 key; value and child nodes follow,
// each at a multiple of 4 bytes from the block's start. The root's value is the fixed information; below it
// are
//   StringFileInfo \ <language and code page, 8 hexadecimal digits> \ <key>   a text
//   VarFileInfo \ Translation                                                 pairs of language and code page
// A file may hold anything: no length or offset is used before it is checked against what contains it, and
// every search ends after at most a block's length of steps.

// Name of the section. cmake/version_resource.cpp.in puts the block there.
inline constexpr char VERSION_RESOURCE_SECTION[] = ".version_resource";

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

// Bytes of a file's version resource. `handle` is set to 0. 0 on failure: ERROR_RESOURCE_DATA_NOT_FOUND for
// a file that is not a program of this system, has no such section or is shorter than it claims, and for a
// block longer than its section; the system's error for a file that cannot be opened;
// ERROR_NOT_ENOUGH_MEMORY. Threads: thread-safe.
DWORD GetFileVersionInfoSizeW(const wchar_t* file, DWORD* handle);

// Reads a file's version resource into a buffer of `length` bytes. `handle` is ignored. 0 on failure:
// ERROR_INSUFFICIENT_BUFFER when the buffer is too small, or as above. Threads: thread-safe.
BOOL GetFileVersionInfoW(const wchar_t* file, DWORD handle, DWORD length, void* data);

// Finds a value in a version resource, which has at least as many bytes as its first word says. `path` is a
// backslash for the fixed information, or the keys on the way, each after a backslash, as above; the block's
// may differ in case, and the first of several nodes of one name counts. `value` is set to its place in the
// block, at any alignment, and `length` to its size: in bytes, or in 16-bit units for a text, which may end
// before. 0 with ERROR_RESOURCE_TYPE_NOT_FOUND, value and length unchanged, when there is no such node within
// its parent, or the root's value is not the fixed information. Threads: reentrant.
BOOL VerQueryValueW(const void* block, const wchar_t* path, void** value, UINT* length);

// ---- Network interfaces ----

inline constexpr DWORD IF_TYPE_OTHER = 1;
inline constexpr DWORD IF_TYPE_ETHERNET_CSMACD = 6;
inline constexpr DWORD IF_TYPE_SOFTWARE_LOOPBACK = 24;
inline constexpr DWORD IF_TYPE_IEEE80211 = 71;

// With the fields of Win32's that are used.
struct MIB_IFROW {
    DWORD dwIndex;
    DWORD dwType;
    DWORD dwPhysAddrLen;
    BYTE bPhysAddr[8];
};

// Followed by further rows: dwNumEntries in all.
struct MIB_IFTABLE {
    DWORD dwNumEntries;
    MIB_IFROW table[1];
};

// Every interface, up or down, with or without an IP address: index, type and hardware address (its first 8
// bytes). Ethernet is what the system reports as such and is not wireless, virtual interfaces included.
// `size` is the buffer's size in bytes, `sorted` selects ascending indexes instead of the system's order. 0,
// or ERROR_INSUFFICIENT_BUFFER with the size needed in `size` and an undefined table, or the system's error.
// Interfaces may come and go between two calls. Threads: thread-safe.
DWORD GetIfTable(MIB_IFTABLE* table, DWORD* size, BOOL sorted);

// The row of the interface whose index the caller has set in it. 0, or with the row unchanged
// ERROR_FILE_NOT_FOUND for an unknown index or the system's error. Threads: thread-safe.
DWORD GetIfEntry(MIB_IFROW* row);

namespace basalt::platform {

// Text of little-endian UTF-16 at any alignment, up to its terminator or `length` units;
// REPLACEMENT_CHARACTER for half a pair.
std::wstring wide_from_utf16(const void* units, std::size_t length);

}  // namespace basalt::platform

#endif

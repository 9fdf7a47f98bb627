/// @file
/// The platform's types, with their Win32 sizes on every system.
///
/// Headers that declare the same types, as macros too, may be included before: unixODBC's sql.h, for example.
#ifndef BASALT_PLATFORM_TYPES_H
#define BASALT_PLATFORM_TYPES_H

#include <cstdint>

#ifndef BOOL
/// Truth value of a platform call: 0 is failure, anything else success.
using BOOL = int;
#endif
#ifndef BYTE
/// 8 bits, unsigned.
using BYTE = std::uint8_t;
#endif
#ifndef WORD
/// 16 bits, unsigned.
using WORD = std::uint16_t;
#endif
#ifndef UINT
/// 32 bits, unsigned.
using UINT = std::uint32_t;
#endif
#ifndef DWORD
/// 32 bits, unsigned.
using DWORD = std::uint32_t;
#endif
#ifndef LONG
/// 32 bits, signed, although `long` has 64 here.
using LONG = std::int32_t;
#endif
#ifndef HRESULT
/// Result code: negative is failure.
using HRESULT = std::int32_t;
#endif
#ifndef HANDLE
/// Reference to an object of the platform layer; null or all ones where a call says so.
using HANDLE = void*;
#endif
#ifndef HINSTANCE
/// Reference to a program or library in memory.
using HINSTANCE = void*;
#endif

static_assert(sizeof(BOOL) == 4 && sizeof(BYTE) == 1 && sizeof(WORD) == 2 && sizeof(UINT) == 4 &&
                  sizeof(DWORD) == 4 && sizeof(LONG) == 4 && sizeof(HRESULT) == 4,
              "another header defines a platform type with a different size");

#ifndef TRUE
/// Success, as a BOOL.
inline constexpr BOOL TRUE = 1;
#endif
#ifndef FALSE
/// Failure, as a BOOL.
inline constexpr BOOL FALSE = 0;
#endif

#endif

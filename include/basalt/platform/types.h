/// @file
/// The platform's integer types, with their published sizes on every system.
#ifndef BASALT_PLATFORM_TYPES_H
#define BASALT_PLATFORM_TYPES_H

#include <cstdint>

/// Truth value of a platform call: 0 is failure, anything else success.
using BOOL = int;
/// 8 bits, unsigned.
using BYTE = std::uint8_t;
/// 16 bits, unsigned.
using WORD = std::uint16_t;
/// 32 bits, unsigned.
using UINT = std::uint32_t;
/// 32 bits, unsigned.
using DWORD = std::uint32_t;
/// 32 bits, signed, although `long` has 64 here.
using LONG = std::int32_t;
/// Result code: negative is failure.
using HRESULT = std::int32_t;
/// Reference to an object of the platform layer; null or all ones where a call says so.
using HANDLE = void*;
/// Reference to a program or library in memory.
using HINSTANCE = void*;

static_assert(sizeof(BOOL) == 4, "platform records hold their truth values in 32 bits");

#endif

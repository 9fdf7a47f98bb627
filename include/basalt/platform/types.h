/// @file
/// The platform's integer types, with their published sizes.
#ifndef BASALT_PLATFORM_TYPES_H
#define BASALT_PLATFORM_TYPES_H

#include <cstdint>

using BOOL = int;
using BYTE = std::uint8_t;
using WORD = std::uint16_t;
using UINT = std::uint32_t;
using DWORD = std::uint32_t;
using LONG = std::int32_t;
using HANDLE = void*;

#endif

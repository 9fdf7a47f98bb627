/// @file
/// Bytes as text of hexadecimal digits, and back; dates stored as such text.
///
/// Threads: every function is reentrant. None throws anything but std::bad_alloc and what it says itself.
#ifndef BASALT_UTIL_HEX_H
#define BASALT_UTIL_HEX_H

#include <string>
#include <vector>

#include "basalt/export.h"
#include "basalt/platform/automation_date.h"

namespace basalt {

/// Two digits for every byte of a text, zeros included: high nibble first, 0 to 9 and a to f, nothing
/// between.
BASALT_API std::string StringToHexString(const std::string& s);

/// Two digits for every byte, high nibble first, 0 to 9 and a to f, nothing between; empty for no bytes.
BASALT_API std::string VectorToHexString(const std::vector<unsigned char>& v);

/// Whether a character is a hexadecimal digit: 0 to 9, A to F, a to f.
BASALT_API bool IsHexChar(char c);

/// Whether a wide character is a hexadecimal digit: 0 to 9, A to F, a to f.
BASALT_API bool IsHexTCHAR(wchar_t c);

/// Whether every character is a hexadecimal digit, characters behind a zero included; true for the empty
/// text.
BASALT_API bool IsHexString(const std::string& s);

/// Text of the bytes that pairs of digits, in either case, stand for.
/// @param hex digits up to the first zero byte
/// Bad input: std::runtime_error "Null terminator in hex string" for a pair that stands for the byte 0. A
/// last digit without a partner is ignored. Characters that are no digits are not refused but give bytes
/// without meaning; IsHexString() tells.
BASALT_API std::string HexStringToString(const std::string& hex);

/// Bytes that pairs of digits, in either case, stand for; 0 as well.
/// @param hex digits up to the first zero byte
/// Bad input: as for HexStringToString(), but nothing is refused.
BASALT_API std::vector<unsigned char> HexStringToVector(const std::string& hex);

/// Reads a date from the digits of eight decimal characters: day and month of two, year of four (from 100
/// on). Fewer characters, with blanks before a field, are read as far as they go: "1 2 2021" is a date.
/// @param hex digits as for HexStringToString(), which may throw; "3031303232303231" is 1 February 2021
/// @param[out] date the date at 0:00, valid; or invalid with a value without meaning
/// @return true, whatever the date
BASALT_API bool ParseDateFromHexString(const std::string& hex, COleDateTime& date);

}  // namespace basalt

#endif

/// @file
/// Bytes to and from hexadecimal text, and dates in that form.
///
/// Threads: every function is reentrant. Beyond what is documented they throw only std::bad_alloc.
#ifndef BASALT_UTIL_HEX_H
#define BASALT_UTIL_HEX_H

#include <string>
#include <vector>

#include "basalt/export.h"
#include "basalt/platform/automation_date.h"

namespace basalt {

/// Two digits for each byte of a text, zeros included: high nibble first, 0 to 9 and a to f, no separators.
BASALT_API std::string StringToHexString(const std::string& s);

/// Two digits for each byte: high nibble first, 0 to 9 and a to f, no separators.
BASALT_API std::string VectorToHexString(const std::vector<unsigned char>& v);

/// Whether a character is a hexadecimal digit: 0 to 9, A to F, a to f.
BASALT_API bool IsHexChar(char c);

/// Whether a wide character is a hexadecimal digit: 0 to 9, A to F, a to f.
BASALT_API bool IsHexTCHAR(wchar_t c);

/// Whether every character is a hexadecimal digit, characters behind a zero included; true for the empty
/// text.
BASALT_API bool IsHexString(const std::string& s);

/// The text encoded by pairs of digits, in either case.
/// @param hex digits up to the first zero byte
/// Bad input: std::runtime_error "Null terminator in hex string" for a pair that encodes the byte 0. An odd
/// last digit is ignored. Other characters are not rejected and produce meaningless bytes; IsHexString()
/// detects them.
BASALT_API std::string HexStringToString(const std::string& hex);

/// The bytes encoded by pairs of digits, in either case; 0 is allowed.
/// @param hex digits up to the first zero byte
/// Bad input: as for HexStringToString(), but never an exception for a byte 0.
BASALT_API std::vector<unsigned char> HexStringToVector(const std::string& hex);

/// Reads a date from hexadecimal text of eight decimal characters: day and month of two, year of four (from
/// 100). Fields may be shorter and follow blanks: "1 2 2021" is a date.
/// @param hex digits as for HexStringToString(), which may throw; "3031303232303231" is 1 February 2021
/// @param[out] date the date at 0:00, valid; or invalid with a meaningless value
/// @return true, also for an invalid date
BASALT_API bool ParseDateFromHexString(const std::string& hex, COleDateTime& date);

}  // namespace basalt

#endif

// Integers as text.
#ifndef BASALT_SRC_PLATFORM_INTEGER_TEXT_H
#define BASALT_SRC_PLATFORM_INTEGER_TEXT_H

#include <cstddef>

using errno_t = int;

// Writes a number in a radix of 2 to 36, lower-case digits, with its terminator into `size` characters: with
// a minus sign in radix 10, as its 32-bit pattern in others.
// 0, or EINVAL for a null or empty buffer (nothing is written) and for another radix, ERANGE for a text that
// does not fit with its terminator; the text is then empty. Threads: reentrant.
errno_t _itow_s(int value, wchar_t* text, std::size_t size, int radix);

#endif

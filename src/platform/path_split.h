// Taking a path apart.
#ifndef BASALT_SRC_PLATFORM_PATH_SPLIT_H
#define BASALT_SRC_PLATFORM_PATH_SPLIT_H

#include <cstddef>

using errno_t = int;

// The published sizes of the four parts' buffers, terminators included.
inline constexpr std::size_t _MAX_DRIVE = 3;
inline constexpr std::size_t _MAX_DIR = 256;
inline constexpr std::size_t _MAX_FNAME = 256;
inline constexpr std::size_t _MAX_EXT = 256;

// Splits a path, without a look at the disk: the drive is the first two characters when the second is a
// colon, the directory ends with the last `\` or `/`, the name ends before the last dot behind that, and the
// extension is the rest, its dot included. So ".profile" is all extension, and the four joined are the path.
// 0, or with all four empty ERANGE when a part and its terminator exceed their buffer, EINVAL for a null
// path. Neither a buffer may be null nor a size 0. Threads: reentrant.
errno_t _wsplitpath_s(const wchar_t* path, wchar_t* drive, std::size_t drive_size, wchar_t* directory,
                      std::size_t directory_size, wchar_t* name, std::size_t name_size, wchar_t* extension,
                      std::size_t extension_size);

#endif

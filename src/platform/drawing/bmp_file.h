// Files in the BMP format.
#ifndef BASALT_SRC_PLATFORM_DRAWING_BMP_FILE_H
#define BASALT_SRC_PLATFORM_DRAWING_BMP_FILE_H

#include "src/platform/pixels/surface.h"

namespace basalt::platform {

// Writes a surface to a file, which is created or truncated: its own depth, uncompressed, bottom row first,
// with the unused byte of 32-bit pixels as 0. The name is UTF-8 on the disk, with either separator. On
// failure false, with the last error set; a file that was begun is emptied and deleted. May throw
// std::bad_alloc for the name.
bool write_bmp_file(const Surface& surface, const wchar_t* name);

}  // namespace basalt::platform

#endif

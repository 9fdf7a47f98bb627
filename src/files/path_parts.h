// A path's four parts as the platform's splitter gives them, which both path classes keep.
#ifndef BASALT_SRC_FILES_PATH_PARTS_H
#define BASALT_SRC_FILES_PATH_PARTS_H

#include <iterator>

#include "src/platform/path_split.h"

namespace basalt::files {

struct PathParts {
    wchar_t drive[_MAX_DRIVE];
    wchar_t directory[_MAX_DIR];
    wchar_t name[_MAX_FNAME];
    wchar_t extension[_MAX_EXT];

    // Takes a path apart; false, with all parts empty, when one of them is too long.
    bool split(const wchar_t* path) {
        return _wsplitpath_s(path, drive, std::size(drive), directory, std::size(directory), name,
                             std::size(name), extension, std::size(extension)) == 0;
    }
};

}  // namespace basalt::files

#endif

// Detection of the operating-system release.
#ifndef BASALT_SRC_FRAME_OS_DETECTION_H
#define BASALT_SRC_FRAME_OS_DETECTION_H

#include "basalt/frame.h"
#include "src/platform/system_info.h"

namespace basalt::frame {

// The release code of a version record, 0 for one that is not in the table.
basalt_os release_code(const OSVERSIONINFOW& version);

// Queries the platform's version and stores the release code. A failed query or an unlisted version leaves
// the stored code unchanged. The stored version number becomes 0 in every case.
void detect_operating_system();

}  // namespace basalt::frame

#endif

// The one report of a failed system call in the allocator family.
#ifndef BASALT_SRC_MEMORY_REPORT_LAST_ERROR_H
#define BASALT_SRC_MEMORY_REPORT_LAST_ERROR_H

namespace vex_lib {

// Writes "ERROR:", the system's message text for the calling thread's last error and "\n" to the debugger
// output, as three pieces; the text is empty when the system has none. Leaves the last error as it was.
// Call it directly after the failing call.
void ReportLastError();

}  // namespace vex_lib

#endif

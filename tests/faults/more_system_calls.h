// Makes further system calls fail (linked with --wrap): access, close, fstatat, ftruncate,
// getifaddrs, lstat, newlocale, pread, readlink, realpath, stat, unlink, write.
#ifndef BASALT_TESTS_FAULTS_MORE_SYSTEM_CALLS_H
#define BASALT_TESTS_FAULTS_MORE_SYSTEM_CALLS_H

namespace basalt::faults {

// Files that were made to stay.
long files_made_to_stay();

}  // namespace basalt::faults

#endif

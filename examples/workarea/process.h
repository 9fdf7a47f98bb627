// What the program asks the system about itself.
#ifndef WORKAREA_PROCESS_H
#define WORKAREA_PROCESS_H

#include <cstdint>
#include <optional>

bool standard_error_is_terminal();

/// Memory of this process held in RAM now, and its largest amount so far; bytes. Nothing where the system
/// does not tell.
std::optional<std::int64_t> resident_memory();
std::optional<std::int64_t> peak_resident_memory();

#endif

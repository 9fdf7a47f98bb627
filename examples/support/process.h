// Memory figures of this process.
#ifndef EXAMPLES_PROCESS_H
#define EXAMPLES_PROCESS_H

#include <cstdint>
#include <optional>

bool standard_error_is_terminal();

/// Memory of this process held in RAM now, and its largest amount so far; bytes. Nothing where the system
/// does not tell.
std::optional<std::int64_t> resident_memory();
std::optional<std::int64_t> peak_resident_memory();

/// Of the memory held in RAM, what is not on a file; bytes. Nothing where the system does not tell.
std::optional<std::int64_t> private_memory();
/// The most private memory, in RAM or not, that this process may take (ulimit -d); bytes. Nothing without a
/// limit.
std::optional<std::int64_t> private_memory_limit();

#endif

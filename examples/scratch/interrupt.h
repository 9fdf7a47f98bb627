// Orderly end on Ctrl-C.
#ifndef SCRATCH_INTERRUPT_H
#define SCRATCH_INTERRUPT_H

#include <stdexcept>

/// Thrown in the middle of the work, so that destructors release everything.
struct Interrupted : std::runtime_error {
    Interrupted() : std::runtime_error("interrupted, nothing is left behind") {}
};

/// From now on SIGINT and SIGTERM only set a flag.
void catch_interrupts();

/// Throws Interrupted if the flag is set. Cheap enough for every few thousand points.
void stop_if_interrupted();

/// Ends the program by the signal received, as a shell expects of an interrupted program; returns if
/// there is none.
void end_as_interrupted();

#endif

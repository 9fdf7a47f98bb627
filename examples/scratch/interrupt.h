// Ending in good order when the user presses Ctrl-C.
#ifndef SCRATCH_INTERRUPT_H
#define SCRATCH_INTERRUPT_H

#include <stdexcept>

/// Thrown in the middle of the work, so that everything it holds is given back on the way out.
struct Interrupted : std::runtime_error {
    Interrupted() : std::runtime_error("interrupted, nothing is left behind") {}
};

/// From now on SIGINT and SIGTERM only leave a mark.
void catch_interrupts();

/// Throws Interrupted if there is a mark. Cheap enough for every few thousand points.
void stop_if_interrupted();

/// Ends the program by the signal that left a mark, as a shell expects of an interrupted program; returns if
/// there is none.
void end_as_interrupted();

#endif

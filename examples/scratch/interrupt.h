// Orderly end on Ctrl-C.
#ifndef SCRATCH_INTERRUPT_H
#define SCRATCH_INTERRUPT_H

#include <csignal>
#include <stdexcept>

inline volatile std::sig_atomic_t received_signal = 0;

/// From now on SIGINT and SIGTERM only set a flag.
inline void catch_interrupts() {
    for (const int signal : {SIGINT, SIGTERM}) {
        std::signal(signal, [](int number) { received_signal = number; });
    }
}

/// Throws if the flag is set, so that destructors release everything. Cheap enough for every few thousand
/// points.
inline void stop_if_interrupted() {
    if (received_signal != 0) {
        throw std::runtime_error("interrupted, nothing is left behind");
    }
}

/// Ends the program by the signal received, as a shell expects of an interrupted program; returns if
/// there is none.
inline void end_as_interrupted() {
    if (received_signal != 0) {
        std::signal(received_signal, SIG_DFL);
        std::raise(received_signal);
    }
}

#endif

#include "interrupt.h"

#include <csignal>

namespace {

volatile std::sig_atomic_t received = 0;

extern "C" void note_signal(int number) {
    received = number;
}

}  // namespace

void catch_interrupts() {
    std::signal(SIGINT, note_signal);
    std::signal(SIGTERM, note_signal);
}

void stop_if_interrupted() {
    if (received != 0) {
        throw Interrupted();
    }
}

void end_as_interrupted() {
    if (received != 0) {
        std::signal(received, SIG_DFL);
        std::raise(received);
    }
}

#include "corbel/cli/StopSignal.h"

#include <csignal>

namespace corbel {

namespace {

// Written by the signal handler, read by the one thread of the command: no lock can be
// taken in a handler, and a volatile sig_atomic_t is what one may write there.
volatile std::sig_atomic_t stopRequested = 0;

extern "C" void onStopSignal(int) {
    stopRequested = 1;
}

}  // namespace

void StopSignal::install() {
    std::signal(SIGINT, onStopSignal);
    std::signal(SIGTERM, onStopSignal);
}

bool StopSignal::requested() {
    return stopRequested != 0;
}

}  // namespace corbel

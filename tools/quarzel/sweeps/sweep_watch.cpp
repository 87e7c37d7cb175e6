// SPDX-License-Identifier: MIT
#include "sweeps/sweep_watch.hpp"

#include <sys/ioctl.h>
#include <unistd.h>

#include <iostream>

namespace quarzel::tool {

namespace {

/// Columns of the terminal; 0: unknown.
std::size_t terminalWidth() {
    winsize size{};
    return ::ioctl(STDERR_FILENO, TIOCGWINSZ, &size) == 0 ? size.ws_col : 0;
}

}  // namespace

SweepWatch::SweepWatch(Checkpoint& checkpoint)
    : itsTable(std::cerr, ::isatty(STDERR_FILENO) != 0, terminalWidth()), itsCheckpoint(checkpoint) {}

void SweepWatch::tick(sweep::Dispatcher& dispatcher) {
    if (itsInterruption.hasCome()) {
        dispatcher.stop();
    }
    itsTable.update(dispatcher);
    itsCheckpoint.update(dispatcher);
}

}  // namespace quarzel::tool

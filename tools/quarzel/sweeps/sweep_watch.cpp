// SPDX-License-Identifier: MIT
#include "sweeps/sweep_watch.hpp"

#include <sys/ioctl.h>
#include <unistd.h>

#include <iostream>

#include "sweeps/live_table.hpp"
#include "sweeps/sweep_log.hpp"

namespace quarzel::tool {

namespace {

/// Columns of the terminal; 0: unknown.
std::size_t terminalWidth() {
    winsize size{};
    return ::ioctl(STDERR_FILENO, TIOCGWINSZ, &size) == 0 ? size.ws_col : 0;
}

std::unique_ptr<SweepDisplay> makeDisplay() {
    if (::isatty(STDERR_FILENO) != 0) {
        return std::make_unique<LiveTable>(std::cerr, terminalWidth);
    }
    return std::make_unique<SweepLog>(std::cerr);
}

}  // namespace

SweepWatch::SweepWatch(Checkpoint& checkpoint) : itsDisplay(makeDisplay()), itsCheckpoint(checkpoint) {}

void SweepWatch::tick(sweep::Dispatcher& dispatcher) {
    if (itsInterruption.hasCome()) {
        dispatcher.stop();
    }
    itsDisplay->update(dispatcher);
    itsCheckpoint.update(dispatcher);
}

bool SweepWatch::finish(const sweep::Dispatcher& dispatcher) {
    return itsDisplay->finish(dispatcher) && ::isatty(STDOUT_FILENO) != 0;
}

}  // namespace quarzel::tool

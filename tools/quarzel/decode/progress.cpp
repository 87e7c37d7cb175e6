// SPDX-License-Identifier: MIT
#include "decode/progress.hpp"

#include <fmt/format.h>

namespace quarzel::tool {

namespace {

constexpr std::chrono::seconds patience{1};
constexpr std::chrono::milliseconds period{100};
constexpr std::size_t width = 30;
constexpr const char* wipe = "\x1b[K";  // from the cursor to the end of the line

}  // namespace

Progress::Progress(std::ostream& terminal, bool visible, std::size_t total, Clock::time_point start)
    : itsTerminal(terminal), itsVisible(visible), itsTotal(total), itsNextDrawing(start + patience) {}

Progress::~Progress() {
    if (itsDrawn) {
        itsTerminal << wipe << std::flush;
    }
}

void Progress::update(std::size_t done, Clock::time_point now) {
    if (!itsVisible || now < itsNextDrawing) {
        return;
    }
    const std::size_t filled = width * done / itsTotal;
    // The cursor rests at the start of the line, so that a warning of the library, which is longer than the
    // bar, takes its place.
    itsTerminal << fmt::format("[{:#<{}}{:.<{}}] {:3} %  {} of {} blocks{}\r", "", filled, "", width - filled,
                               100 * done / itsTotal, done, itsTotal, wipe)
                << std::flush;
    itsNextDrawing = now + period;
    itsDrawn = true;
}

}  // namespace quarzel::tool

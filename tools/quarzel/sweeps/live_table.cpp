// SPDX-License-Identifier: MIT
#include "sweeps/live_table.hpp"

#include <fmt/format.h>

#include "sweeps/sweep_table.hpp"

namespace quarzel::tool {

namespace {

constexpr std::chrono::milliseconds period{200};
constexpr const char* wipeLine = "\x1b[K";   // from the cursor to the end of the line
constexpr const char* wipeBelow = "\x1b[J";  // from the cursor to the end of the screen
constexpr const char* up = "\x1b[A";

}  // namespace

void LiveTable::drawPoint(const sweep::Dispatcher& dispatcher, std::size_t index) {
    const sweep::Setup& setup = dispatcher.plan().points[index].setup;
    printPoint(itsTerminal, setup, dispatcher.stateOf(index),
               !itsLast || !sweep::isSameCurve(setup, *itsLast));
    itsLast = setup;
}

/// The cursor rests where the lines begin, so that what is drawn next takes their place.
void LiveTable::drawStatus(const sweep::Dispatcher& dispatcher, std::size_t current, Clock::time_point now) {
    const sweep::Setup& setup = dispatcher.plan().points[current].setup;
    const sweep::PointState point = dispatcher.stateOf(current);
    const SweepProgress progress = itsMeter.measure(dispatcher, now);
    const std::size_t width = itsWidth();
    const auto cut = [width](std::string line) { return width == 0 ? line : line.substr(0, width - 1); };
    const std::string row = point.blocks == 0 ? sweep::curveText(setup) : rowText(setup, point);
    itsTerminal << cut(row) << wipeLine << '\n'
                << cut(fmt::format("{}, {:.1f} Mbit/s", progress.text(), progress.bitsPerSecond / 1e6))
                << wipeLine << '\r' << up;
}

void LiveTable::update(const sweep::Dispatcher& dispatcher, Clock::time_point now) {
    if (!itsHasBegun) {
        itsMeter.measure(dispatcher, now);
        itsHasBegun = true;
    }
    if (now < itsNextDrawing) {
        return;
    }
    const std::size_t unfinished = dispatcher.firstUnfinished();
    if (itsPointsDrawn < unfinished) {
        itsTerminal << wipeBelow;
    }
    for (; itsPointsDrawn < unfinished; ++itsPointsDrawn) {
        if (!dispatcher.isLeftOut(itsPointsDrawn)) {
            drawPoint(dispatcher, itsPointsDrawn);
        }
    }
    if (unfinished < dispatcher.plan().points.size()) {
        drawStatus(dispatcher, unfinished, now);
    }
    itsTerminal << std::flush;
    itsIsDrawn = true;
    itsNextDrawing = now + period;
}

bool LiveTable::finish(const sweep::Dispatcher& dispatcher) {
    if (!itsIsDrawn) {
        return false;
    }
    itsTerminal << wipeBelow;
    for (; itsPointsDrawn < dispatcher.plan().points.size(); ++itsPointsDrawn) {
        if (!dispatcher.isLeftOut(itsPointsDrawn) && dispatcher.stateOf(itsPointsDrawn).blocks != 0) {
            drawPoint(dispatcher, itsPointsDrawn);
        }
    }
    itsTerminal << std::flush;
    return true;
}

}  // namespace quarzel::tool

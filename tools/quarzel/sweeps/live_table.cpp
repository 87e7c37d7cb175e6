// SPDX-License-Identifier: MIT
#include "sweeps/live_table.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <cstdint>
#include <optional>

#include "sweeps/sweep_table.hpp"

namespace quarzel::tool {

namespace {

constexpr std::chrono::seconds patience{1};
constexpr std::chrono::milliseconds period{200};
constexpr const char* wipe = "\x1b[K";  // from the cursor to the end of the line

std::string durationText(double seconds) {
    const auto whole = static_cast<std::uint64_t>(seconds);
    return fmt::format("{}:{:02}:{:02}", whole / 3600, whole / 60 % 60, whole % 60);
}

/// The blocks that a point will probably have at its end, from what it has now.
double expectedBlocks(const sweep::PointState& point, const sweep::Configuration& configuration,
                      double shards) {
    const double maxBlocks = static_cast<double>(configuration.maxBlocks) / shards;
    const auto errors = static_cast<double>(point.last().blockErrors);
    if (configuration.maxBlockErrors == 0 || errors == 0) {
        return maxBlocks;
    }
    const auto wanted = static_cast<double>(configuration.maxBlockErrors);
    return std::min(maxBlocks, static_cast<double>(point.blocks) * wanted / errors);
}

}  // namespace

LiveTable::LiveTable(std::ostream& terminal, bool visible, std::size_t width, Clock::time_point start)
    : itsTerminal(terminal), itsVisible(visible), itsWidth(width), itsNextDrawing(start + patience) {}

LiveTable::~LiveTable() {
    if (itsHeadingsDrawn != 0) {
        itsTerminal << wipe << std::flush;
    }
}

void LiveTable::draw(const std::string& row, char end) {
    const std::size_t room = itsWidth == 0 ? row.size() : itsWidth - 1;
    itsTerminal << row.substr(0, room) << wipe << end;
}

/// The speed of a point, the time it has taken and the time that is left.
std::string LiveTable::timesOf(const sweep::PointState& point, const sweep::Dispatcher& dispatcher,
                               const sweep::Curve& curve) const {
    if (point.seconds <= 0 || point.blocks == 0) {
        return "";
    }
    const double blocksPerSecond = static_cast<double>(point.blocks) / point.seconds;
    const double left =
        expectedBlocks(point, dispatcher.configuration(), static_cast<double>(dispatcher.shard().count)) -
        static_cast<double>(point.blocks);
    return fmt::format("{:>9.1f}{:>9}{:>9}", blocksPerSecond * curve.blockSize / 1e6,
                       durationText(point.seconds),
                       point.stoppedBy ? "" : durationText(std::max(left, 0.0) / blocksPerSecond));
}

void LiveTable::drawPoint(const sweep::Dispatcher& dispatcher, std::size_t index) {
    const std::size_t pointsPerCurve = dispatcher.configuration().ebN0.size();
    const sweep::Curve& curve = dispatcher.curves()[index / pointsPerCurve];
    if (itsHeadingsDrawn <= index / pointsPerCurve) {
        draw(curveText(curve), '\n');
        draw(fmt::format("{:<90}{}", sweepHeadings, "Mbit/s  elapsed     left"), '\n');
        itsHeadingsDrawn = index / pointsPerCurve + 1;
    }
    const sweep::PointState point = dispatcher.stateOf(index);
    draw(fmt::format("{:<87}{}",
                     rowText(point, dispatcher.configuration().ebN0[index % pointsPerCurve], curve),
                     timesOf(point, dispatcher, curve)),
         point.stoppedBy ? '\n' : '\r');
}

void LiveTable::update(const sweep::Dispatcher& dispatcher, Clock::time_point now) {
    if (!itsVisible || now < itsNextDrawing) {
        return;
    }
    const std::size_t unfinished = dispatcher.firstUnfinished();
    for (; itsPointsDrawn < unfinished; ++itsPointsDrawn) {
        drawPoint(dispatcher, itsPointsDrawn);
    }
    if (unfinished < dispatcher.configuration().points()) {
        drawPoint(dispatcher, unfinished);
    }
    itsTerminal << std::flush;
    itsNextDrawing = now + period;
}

}  // namespace quarzel::tool

// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <cstddef>
#include <ostream>
#include <string>

#include "sweep/dispatcher.hpp"

namespace quarzel::tool {

/// A table on a terminal that shows the progress of a sweep: a row for each point that has ended, and one for
/// the current point, which changes.
class LiveTable {
  public:
    using Clock = std::chrono::steady_clock;

    /// @param terminal  where it is drawn
    /// @param visible   whether it is drawn at all
    /// @param width     columns of the terminal; 0: unknown
    LiveTable(std::ostream& terminal, bool visible, std::size_t width,
              Clock::time_point start = Clock::now());
    LiveTable(const LiveTable&) = delete;
    LiveTable& operator=(const LiveTable&) = delete;
    ~LiveTable();

    /// Show how far the sweep is. Cheap: it draws at most five times a second, and the points that have
    /// ended.
    void update(const sweep::Dispatcher& dispatcher, Clock::time_point now = Clock::now());

  private:
    void draw(const std::string& row, char end);
    void drawPoint(const sweep::Dispatcher& dispatcher, std::size_t point);
    std::string timesOf(const sweep::PointState& point, const sweep::Dispatcher& dispatcher,
                        const sweep::Curve& curve) const;

    std::ostream& itsTerminal;
    bool itsVisible;
    std::size_t itsWidth;
    Clock::time_point itsNextDrawing;
    std::size_t itsPointsDrawn = 0;
    std::size_t itsHeadingsDrawn = 0;  ///< for this many curves
};

}  // namespace quarzel::tool

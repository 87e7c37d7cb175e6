// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <functional>
#include <optional>
#include <ostream>
#include <string>

#include "sweeps/sweep_display.hpp"
#include "sweeps/sweep_progress.hpp"

namespace quarzel::tool {

/// The table of a sweep as it grows on a terminal. Below the points that have ended stand the current one and
/// a line for the whole sweep, which change.
class LiveTable : public SweepDisplay {
  public:
    /// @param terminal  where it is drawn; must outlive it
    /// @param width     tells the columns of the terminal, which may change; 0: unknown
    LiveTable(std::ostream& terminal, std::function<std::size_t()> width,
              Clock::time_point start = Clock::now())
        : itsTerminal(terminal), itsWidth(std::move(width)), itsNextDrawing(start + patience) {}

    /// Cheap: it draws at most five times a second, and the points that have ended.
    void update(const sweep::Dispatcher& dispatcher, Clock::time_point now = Clock::now()) override;
    bool finish(const sweep::Dispatcher& dispatcher) override;

  private:
    void drawPoint(const sweep::Dispatcher& dispatcher, std::size_t point);
    void drawStatus(const sweep::Dispatcher& dispatcher, std::size_t current, Clock::time_point now);

    std::ostream& itsTerminal;
    std::function<std::size_t()> itsWidth;
    Clock::time_point itsNextDrawing;
    ProgressMeter itsMeter;
    bool itsHasBegun = false;
    bool itsIsDrawn = false;
    std::size_t itsPointsDrawn = 0;
    std::optional<sweep::Setup> itsLast;  ///< the last one, whose curve has its headings
};

}  // namespace quarzel::tool

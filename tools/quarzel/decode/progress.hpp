// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <cstddef>
#include <ostream>

namespace quarzel::tool {

/// A bar that tells the user of a terminal how far long work has come. It appears after a second and is wiped
/// at the end.
class Progress {
  public:
    using Clock = std::chrono::steady_clock;

    /// @param terminal  where the bar is drawn
    /// @param visible   whether it is drawn at all
    /// @param total     blocks that there are to decode, at least 1
    Progress(std::ostream& terminal, bool visible, std::size_t total, Clock::time_point start = Clock::now());
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;
    ~Progress();

    /// Tell that `done` of the blocks are decoded. Cheap: draws ten times a second at most.
    void update(std::size_t done, Clock::time_point now = Clock::now());

  private:
    std::ostream& itsTerminal;
    bool itsVisible;
    std::size_t itsTotal;
    Clock::time_point itsNextDrawing;
    bool itsDrawn = false;
};

}  // namespace quarzel::tool

// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <cstddef>
#include <ostream>

namespace quarzel::tool {

/// Tells how far long work has come: on a terminal by a bar, which appears after a second and is wiped at the
/// end; elsewhere by a line a minute.
class Progress {
  public:
    using Clock = std::chrono::steady_clock;

    /// @param stream      where it is told
    /// @param isTerminal  whether that is a terminal
    /// @param total       blocks that there are to decode, at least 1
    Progress(std::ostream& stream, bool isTerminal, std::size_t total,
             Clock::time_point start = Clock::now());
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;
    ~Progress();

    /// Tell that `done` of the blocks are decoded. Cheap: tells it ten times a second at most.
    void update(std::size_t done, Clock::time_point now = Clock::now());

  private:
    void draw(std::size_t done);
    void log(std::size_t done, double seconds);

    std::ostream& itsStream;
    bool itsIsTerminal;
    std::size_t itsTotal;
    Clock::time_point itsStart;
    Clock::time_point itsNextTime;
    bool itsIsDrawn = false;
};

}  // namespace quarzel::tool

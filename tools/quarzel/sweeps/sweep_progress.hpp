// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>

#include "sweep/dispatcher.hpp"

namespace quarzel::tool {

/// How far a sweep has come as a whole.
struct SweepProgress {
    std::size_t points = 0;  ///< of the sweep
    std::size_t pointsDone = 0;
    std::uint64_t blocks = 0;
    std::uint64_t blockErrors = 0;
    double bitsPerSecond = 0;           ///< information bits of this run
    std::optional<double> secondsLeft;  ///< none: nothing tells yet

    /// "3 of 12 points, 4567 blocks, 89 block errors, 0:12:33 left".
    std::string text() const;
};

/// Measures the progress of a sweep and foretells its end.
///
/// A point that has errors ends when it has as many as are wanted, at the rate it has had so far. One that
/// has not begun is taken to need more blocks than the point before it on its curve, by the factor by which
/// that one needs more than its own; the first of a curve as many as the first of the curve before. A block
/// costs as much as its bits and iterations.
class ProgressMeter {
  public:
    using Clock = std::chrono::steady_clock;

    /// The progress now. The first call is to come when the run begins.
    SweepProgress measure(const sweep::Dispatcher& dispatcher, Clock::time_point now = Clock::now());

  private:
    struct Beginning {
        Clock::time_point time;
        double bits;
        double cost;
    };

    std::optional<Beginning> itsBeginning;
};

}  // namespace quarzel::tool

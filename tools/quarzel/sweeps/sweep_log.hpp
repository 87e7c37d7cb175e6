// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <ostream>

#include "sweeps/sweep_display.hpp"
#include "sweeps/sweep_progress.hpp"

namespace quarzel::tool {

/// A log of a sweep: a line for each point that has ended and one a minute for the whole.
class SweepLog : public SweepDisplay {
  public:
    /// @param stream  where it goes; must outlive it
    explicit SweepLog(std::ostream& stream, Clock::time_point start = Clock::now())
        : itsStream(stream), itsFirstTime(start + patience), itsNextMinute(start + std::chrono::minutes(1)) {}

    void update(const sweep::Dispatcher& dispatcher, Clock::time_point now = Clock::now()) override;
    bool finish(const sweep::Dispatcher& dispatcher) override;

  private:
    void tellPoints(const sweep::Dispatcher& dispatcher);

    std::ostream& itsStream;
    Clock::time_point itsFirstTime;
    Clock::time_point itsNextMinute;
    ProgressMeter itsMeter;
    bool itsHasBegun = false;
    bool itsIsSilent = true;
    std::size_t itsPointsTold = 0;
};

}  // namespace quarzel::tool

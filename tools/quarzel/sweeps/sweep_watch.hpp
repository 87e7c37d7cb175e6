// SPDX-License-Identifier: MIT
#pragma once

#include <memory>

#include "sweep/run.hpp"
#include "sweeps/checkpoint.hpp"
#include "sweeps/interruption.hpp"
#include "sweeps/sweep_display.hpp"

namespace quarzel::tool {

/// Shows a sweep on standard error, keeps what is done, and ends it when a signal comes.
class SweepWatch : public sweep::Observer {
  public:
    /// @param checkpoint  not owned, must outlive the watch
    explicit SweepWatch(Checkpoint& checkpoint);

    void tick(sweep::Dispatcher& dispatcher) override;

    /// To be called when the sweep has ended.
    /// @return whether standard output is the terminal that already shows the table of all that is done
    bool finish(const sweep::Dispatcher& dispatcher);

  private:
    Interruption itsInterruption;
    std::unique_ptr<SweepDisplay> itsDisplay;
    Checkpoint& itsCheckpoint;
};

}  // namespace quarzel::tool

// SPDX-License-Identifier: MIT
#pragma once

#include "sweep/run.hpp"
#include "sweeps/checkpoint.hpp"
#include "sweeps/interruption.hpp"
#include "sweeps/live_table.hpp"

namespace quarzel::tool {

/// Shows a sweep on the terminal, keeps what is done, and ends it when a signal comes.
class SweepWatch : public sweep::Observer {
  public:
    /// @param checkpoint  not owned, must outlive the watch
    explicit SweepWatch(Checkpoint& checkpoint);

    void tick(sweep::Dispatcher& dispatcher) override;

  private:
    Interruption itsInterruption;
    LiveTable itsTable;
    Checkpoint& itsCheckpoint;
};

}  // namespace quarzel::tool

// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <optional>
#include <string>

#include "sweep/dispatcher.hpp"
#include "sweep/part.hpp"

namespace quarzel::tool {

/// The file that keeps what a sweep has done, so that no interruption loses it.
class Checkpoint {
  public:
    using Clock = std::chrono::steady_clock;

    /// @param file    empty: there is none
    /// @param period  how often it is renewed
    Checkpoint(std::string file, std::chrono::seconds period);

    /// Throw a ToolError when it could not be written.
    void probe() const;

    /// Whether there is one from an earlier run.
    bool exists() const;

    /// What an earlier run has left.
    /// @throws ToolError when it is broken or belongs to another run
    sweep::Part load(const sweep::Configuration& configuration, const sweep::Shard& shard) const;

    /// Renew it when it is time. A failure is told on standard error, once, and does not stop the sweep.
    void update(const sweep::Dispatcher& dispatcher, Clock::time_point now = Clock::now());

    /// Renew it now.
    /// @return whether it could be
    bool save(const sweep::Dispatcher& dispatcher);

    /// Remove it: it has served its purpose.
    void remove() const;

    const std::string& file() const { return itsFile; }

  private:
    std::string itsFile;
    std::chrono::seconds itsPeriod;
    Clock::time_point itsNextTime;
    bool itsFailureIsTold = false;
};

}  // namespace quarzel::tool

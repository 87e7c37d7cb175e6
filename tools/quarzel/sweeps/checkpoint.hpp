// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <optional>
#include <string>

#include "sweep/dispatcher.hpp"
#include "sweep/part.hpp"

namespace quarzel::tool {

/// The file that keeps what a sweep has done, so that an interruption loses nothing.
class Checkpoint {
  public:
    using Clock = std::chrono::steady_clock;

    /// @param file    empty: there is none
    /// @param period  how often it is renewed
    Checkpoint(std::string file, std::chrono::seconds period);

    /// @throws ToolError when it could not be written
    void probe() const;

    /// Whether an earlier run has left one.
    bool exists() const;

    /// Read what an earlier run has left.
    /// @throws ToolError when it is broken or belongs to another run
    sweep::Part load(const sweep::Configuration& configuration, const sweep::Shard& shard) const;

    /// Renew it when it is due. A failure is reported on standard error, once, and does not stop the sweep.
    void update(const sweep::Dispatcher& dispatcher, Clock::time_point now = Clock::now());

    /// Renew it now.
    /// @return whether it could be
    bool save(const sweep::Dispatcher& dispatcher);

    /// Remove it, since the sweep is done.
    void remove() const;

    const std::string& file() const { return itsFile; }

  private:
    std::string itsFile;
    std::chrono::seconds itsPeriod;
    Clock::time_point itsNextTime;
    bool itsFailureIsReported = false;
};

}  // namespace quarzel::tool

// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <optional>
#include <string>

#include "files/file_lock.hpp"
#include "sweep/dispatcher.hpp"
#include "sweep/result.hpp"

namespace quarzel::tool {

/// The file that keeps what a sweep has done, so that an interruption loses nothing.
class Checkpoint {
  public:
    using Clock = std::chrono::steady_clock;

    /// @param file    empty: there is none
    /// @param period  how often it is renewed
    /// @param part    which part of a sweep it is of
    Checkpoint(std::string file, std::chrono::seconds period, std::optional<sweep::Part> part = {});

    /// Keep other sweeps from it while this lives.
    /// @throws ToolError when another one has it
    void lock();

    /// @throws ToolError when it could not be written
    void probe() const;

    /// Whether an earlier run has left one.
    bool exists() const;

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
    std::optional<FileLock> itsLock;
    std::chrono::seconds itsPeriod;
    std::optional<sweep::Part> itsPart;
    Clock::time_point itsNextTime;
    bool itsFailureIsReported = false;
};

}  // namespace quarzel::tool

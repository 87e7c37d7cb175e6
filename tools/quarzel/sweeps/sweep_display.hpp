// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>

#include "sweep/dispatcher.hpp"

namespace quarzel::tool {

/// What people see of a sweep while it runs. It stays silent for the first second.
class SweepDisplay {
  public:
    using Clock = std::chrono::steady_clock;

    static constexpr std::chrono::seconds patience{1};

    virtual ~SweepDisplay() = default;

    /// Show how far the sweep is. To be called several times a second, from the beginning.
    virtual void update(const sweep::Dispatcher& dispatcher, Clock::time_point now = Clock::now()) = 0;

    /// Show what is still to be shown when the sweep has ended.
    /// @return whether the table of all that is done has been shown, as `printTable` prints it
    virtual bool finish(const sweep::Dispatcher& dispatcher) = 0;
};

}  // namespace quarzel::tool

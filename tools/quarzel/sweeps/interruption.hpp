// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <csignal>

namespace quarzel::tool {

/// While it lives, the first SIGINT, SIGTERM or SIGHUP is noted and does not end the process; one that comes
/// more than a second later does. Those that the process was started to ignore stay ignored. There may be one
/// of these at a time.
class Interruption {
  public:
    Interruption();
    Interruption(const Interruption&) = delete;
    Interruption& operator=(const Interruption&) = delete;
    ~Interruption();

    /// Whether a signal has come.
    bool hasCome() const;

  private:
    static constexpr std::array signals = {SIGINT, SIGTERM, SIGHUP};

    std::array<struct sigaction, signals.size()> itsFormer{};
};

}  // namespace quarzel::tool

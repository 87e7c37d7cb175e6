// SPDX-License-Identifier: MIT
#pragma once

#include <csignal>

namespace quarzel::tool {

/// While it lives, the first SIGINT or SIGTERM is noted and does not end the process; one that comes more
/// than a second later does. There may be one of these at a time.
class Interruption {
  public:
    Interruption();
    Interruption(const Interruption&) = delete;
    Interruption& operator=(const Interruption&) = delete;
    ~Interruption();

    /// Whether a signal has come.
    bool hasCome() const;

  private:
    struct sigaction itsFormerInterrupt {};
    struct sigaction itsFormerTermination {};
};

}  // namespace quarzel::tool

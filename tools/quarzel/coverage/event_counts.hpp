// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <vector>

#include "coverage/event.hpp"

namespace quarzel::tool {

/// How often each event has come at each of its positions.
class EventCounts {
  public:
    EventCounts();

    void add(Event event, std::size_t position) { ++itsCounts[static_cast<std::size_t>(event)][position]; }

    /// Count an event if it has come.
    void addIf(bool hasCome, Event event, std::size_t position) {
        itsCounts[static_cast<std::size_t>(event)][position] += hasCome ? 1 : 0;
    }

    EventCounts& operator+=(const EventCounts& other);

    /// The counts of an event by its positions.
    const std::vector<std::size_t>& of(Event event) const {
        return itsCounts[static_cast<std::size_t>(event)];
    }

  private:
    std::vector<std::vector<std::size_t>> itsCounts;
};

}  // namespace quarzel::tool

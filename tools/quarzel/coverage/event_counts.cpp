// SPDX-License-Identifier: MIT
#include "coverage/event_counts.hpp"

namespace quarzel::tool {

EventCounts::EventCounts() {
    for (const EventFacts& facts : eventFacts()) {
        itsCounts.emplace_back(facts.positions.size());
    }
}

EventCounts& EventCounts::operator+=(const EventCounts& other) {
    for (std::size_t event = 0; event < itsCounts.size(); ++event) {
        for (std::size_t position = 0; position < itsCounts[event].size(); ++position) {
            itsCounts[event][position] += other.itsCounts[event][position];
        }
    }
    return *this;
}

}  // namespace quarzel::tool

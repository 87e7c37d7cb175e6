// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>

#include "coverage/event_counts.hpp"
#include "quarzel/code.hpp"
#include "trace/step_metrics.hpp"

namespace quarzel::tool {

/// The 16 points of the correction table are steps of 1/2: four units of 1/8.
constexpr std::size_t correctionEntries = 16;
constexpr int correctionStep = 4;

/// A metric, in units of 1/8, with the correction that the next maximum adds.
struct Candidate {
    int value = 0;
    int pending = 0;
};

/// A metric plus a branch metric, as the register holds it.
/// @param event  counted when it wraps around
inline Candidate plus(const Candidate& metric, int branch, Event event, std::size_t position,
                      EventCounts& counts) {
    const int value = wrapped(metric.value + branch);
    counts.addIf(value != metric.value + branch, event, position);
    return {value, metric.pending};
}

/// What the comparison of two candidates can be.
struct Comparison {
    Event tie;
    Event order;
    Event correction;
};

/// The modulo maximum of a core, which counts what happens in it.
class Maximum {
  public:
    explicit Maximum(int algorithm) : itsAddsCorrections(algorithm == 2) {}

    /// The larger one of two candidates, the first one at a tie.
    Candidate larger(const Candidate& first, const Candidate& second, const Comparison& events,
                     std::size_t position, EventCounts& counts) const {
        const int plain = first.value - second.value;
        const int difference = wrapped(plain);
        counts.addIf(difference == 0, events.tie, position);
        counts.addIf(difference != plain, events.order, position);
        const Candidate& larger = difference < 0 ? second : first;
        if (!itsAddsCorrections) {
            return larger;
        }
        const std::size_t magnitude = static_cast<std::size_t>(difference < 0 ? -difference - 1 : difference);
        const std::size_t entry = std::min(magnitude / correctionStep, correctionEntries);
        counts.add(events.correction, entry + (difference < 0 ? correctionEntries + 1 : 0));
        return {wrapped(larger.value + larger.pending),
                itsCorrections[static_cast<std::size_t>(difference + 2048)]};
    }

  private:
    bool itsAddsCorrections;
    std::array<unsigned char, 4096> itsCorrections = corrections();
};

}  // namespace quarzel::tool

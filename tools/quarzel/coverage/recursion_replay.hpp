// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <vector>

#include "coverage/event_counts.hpp"
#include "coverage/maximum.hpp"
#include "coverage/pass_values.hpp"
#include "coverage/trellis_table.hpp"

namespace quarzel::tool {

/// Runs the recursions of passes again, to count what happens in them. Passes of a block come in their order.
class RecursionReplay {
  public:
    /// @param trellis, maximum, counts  must outlive it
    RecursionReplay(std::uint32_t units, const TrellisTable& trellis, const Maximum& maximum,
                    EventCounts& counts)
        : itsUnits(units), itsTrellis(trellis), itsMaximum(maximum), itsCounts(counts) {}

    /// Count the events of a pass.
    /// @throws std::logic_error when its values do not follow from one another
    void add(const PassValues& pass);

  private:
    using Candidates = std::array<Candidate, encoderStates>;

    /// A window of the backward recursion.
    struct Window {
        std::size_t bottom;
        std::size_t top;
        bool isHighest;       ///< of its segment
        bool startsWithTail;  ///< the highest one of the last segment
    };

    void start(std::uint32_t K);
    void addAlpha(const PassValues& pass);
    void addBeta(const PassValues& pass);
    Candidates alphaStep(const Candidates& before, const PassValues& pass, std::size_t step);
    Candidates betaStep(const Candidates& after, const PassValues& pass, std::size_t step);
    Metrics tailMetrics(const PassValues& pass);
    Metrics masked(const Candidates& metrics, Event mask, Event pending);

    std::uint32_t itsUnits;
    const TrellisTable& itsTrellis;
    const Maximum& itsMaximum;
    EventCounts& itsCounts;
    Layout itsLayout{};
    std::vector<Window> itsWindows;  ///< the lowest ones of all segments, then those above them
    std::array<std::vector<Metrics>, 2> itsAlphaStarts;  ///< of a code's next pass, by segment
    std::array<std::vector<Metrics>, 2> itsBetaStarts;   ///< the same by window
};

}  // namespace quarzel::tool

// SPDX-License-Identifier: MIT
#pragma once

#include <vector>

#include "coverage/event_counts.hpp"
#include "coverage/maximum.hpp"
#include "coverage/pass_values.hpp"
#include "coverage/recursion_replay.hpp"
#include "coverage/trellis_table.hpp"

namespace quarzel::tool {

/// Computes passes again from what the library hands on of them, to count what happens in the arithmetic.
/// The decoder itself counts nothing.
class PassReplay {
  public:
    PassReplay(std::uint32_t units, int algorithm)
        : itsAlgorithm(algorithm),
          itsMaximum(algorithm),
          itsRecursions(units, itsTrellis, itsMaximum, itsCounts) {}
    PassReplay(const PassReplay&) = delete;
    PassReplay& operator=(const PassReplay&) = delete;

    /// Count the events of a pass. Passes of a block come in their order, from the first one on.
    /// @param isLast  whether the block is decided by it
    /// @throws std::logic_error when its values do not follow from one another
    void add(const vardel_ip_quarzel_pass& pass, bool isLast);

    const EventCounts& counts() const { return itsCounts; }

  private:
    void addAPriori();
    void addBranches(const PassValues& pass);
    void addRatios(const PassValues& pass, bool isLast);
    int ratioAt(const PassValues& pass, std::size_t step);
    Candidate bestOf(std::size_t bit, const Metrics& alpha, const Metrics& beta, const PassValues& pass,
                     std::size_t step);
    void addExtrinsic(const PassValues& pass);

    int itsAlgorithm;
    TrellisTable itsTrellis;
    Maximum itsMaximum;
    EventCounts itsCounts;
    RecursionReplay itsRecursions;
    std::vector<int> itsExtrinsic;  ///< of the pass before
};

}  // namespace quarzel::tool

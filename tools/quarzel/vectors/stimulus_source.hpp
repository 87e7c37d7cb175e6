// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <vector>

#include "link/quantised_channel.hpp"
#include "vectors/vector_plan.hpp"

namespace quarzel::tool {

/// Makes the soft values of planned blocks. They depend on the request's seed, channel and the block alone,
/// and for noise in a segment on the number of units.
///
/// Thread rule: `make` may be called from several threads at once.
class StimulusSource {
  public:
    explicit StimulusSource(const VectorRequest& request);

    /// The 3 (K + 4) soft values of a block: systematic, parity 1, parity 2.
    /// @param units  of the core that it is for
    std::vector<std::int8_t> make(const PlannedBlock& block, std::uint32_t units) const;

  private:
    std::uint64_t itsSeed;
    link::Decibels itsEbN0;
    link::QuantisedChannel itsChannel;
};

}  // namespace quarzel::tool

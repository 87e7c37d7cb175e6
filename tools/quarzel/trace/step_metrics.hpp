// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>

#include "quarzel/code.hpp"

namespace quarzel::tool {

/// A value of 12 bits, in units of 1/8, as a register keeps it.
constexpr int wrapped(int value) {
    return ((value + 2048) & 4095) - 2048;
}

/// A path into a state or through a step: its sum, and where it comes from.
struct StepMetric {
    int value = 0;
    int pending = 0;     ///< the correction that the next maximum adds
    unsigned state = 0;  ///< the state at the other end of the step
    unsigned bit = 0;    ///< information bit of the branch
};

/// The arithmetic of a trellis step in the core, on the values that a trace shows.
class StepRule {
  public:
    /// @param hasCorrections  whether maxima are corrected, as in algorithm type 2
    explicit StepRule(bool hasCorrections) : itsHasCorrections(hasCorrections) {}

    /// The maximum as the core's hardware takes it: the first one of two equal ones, each with the correction
    /// that is pending for it; its own correction becomes pending.
    StepMetric larger(const StepMetric& x, const StepMetric& y) const;

    /// Log-likelihood ratio, and the best paths for bit 1 and bit 0, with all their corrections.
    struct Ratio {
        int llr;
        std::array<StepMetric, 2> best;  ///< by bit
    };

    /// @param a  forward metric of a state before the step
    /// @param b  backward metric of a state after it
    /// @param g  branch metric in a column, 4 to 7
    Ratio ratio(const std::function<int(unsigned)>& a, const std::function<int(unsigned)>& b,
                const std::function<int(unsigned)>& g) const;

    bool hasCorrections() const { return itsHasCorrections; }

  private:
    bool itsHasCorrections;
};

/// The branch of an information bit into a state.
Branch branchInto(unsigned state, unsigned bit);

}  // namespace quarzel::tool

// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <stdexcept>

#include "quarzel/code.hpp"

namespace quarzel::tool {

using Metrics = std::array<int, encoderStates>;

/// The values of a pass in units of 1/8.
class PassValues {
  public:
    explicit PassValues(const vardel_ip_quarzel_pass& pass) : itsPass(pass) {}

    unsigned number() const { return itsPass.pass; }
    std::size_t code() const { return itsPass.code - 1; }
    std::uint32_t K() const { return itsPass.block_size; }

    int systematic(std::size_t step) const { return itsPass.inputs[code()][0][step] / wordsPerUnit; }
    int parity(std::size_t step) const { return itsPass.inputs[code()][1][step] / wordsPerUnit; }
    /// Channel and a-priori value. The core holds it at half scale, with a bit more.
    int intrinsic(std::size_t step) const { return itsPass.intrinsic[step] / (wordsPerUnit / 2); }
    int branch(std::size_t step, std::size_t column) const {
        return itsPass.gamma[4 * step + column] / wordsPerUnit;
    }
    int ratio(std::size_t step) const { return itsPass.llr[step] / wordsPerUnit; }
    int extrinsic(std::size_t step) const { return itsPass.extrinsic[step] / wordsPerUnit; }

    Metrics alpha(std::size_t step) const { return metrics(itsPass.alpha, step); }
    Metrics beta(std::size_t step) const { return metrics(itsPass.beta, step); }

  private:
    static constexpr int wordsPerUnit = 16;

    static Metrics metrics(const std::int16_t* words, std::size_t step) {
        Metrics metrics{};
        for (std::size_t state = 0; state < metrics.size(); ++state) {
            metrics[state] = words[encoderStates * step + state] / wordsPerUnit;
        }
        return metrics;
    }

    const vardel_ip_quarzel_pass& itsPass;
};

/// Events are counted from values that are computed anew. Where these are not those of the pass, no count
/// would be right.
/// @throws std::logic_error
inline void requireEqual(const auto& computed, const auto& ofPass) {
    if (computed != ofPass) {
        throw std::logic_error("the values of a pass do not follow from one another");
    }
}

}  // namespace quarzel::tool

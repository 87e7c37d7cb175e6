// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <string_view>
#include <vector>

#include "quarzel/core.hpp"

namespace quarzel::tool {

/// Writes passes in a form for other programs.
class TraceWriter {
  public:
    using Write = std::function<void(std::string_view text)>;

    virtual ~TraceWriter() = default;

    /// Write a pass.
    virtual void add(const vardel_ip_quarzel_pass& pass) = 0;

    /// Write what stands at the end.
    virtual void end() = 0;
};

/// Call `take(step, column, word)` for every value of a pass, in the order of a trace's table.
template <class Take>
void forEachValue(const vardel_ip_quarzel_pass& pass, const Take& take) {
    const std::array<const std::int16_t*, 6> words = {pass.intrinsic, pass.alpha, pass.beta,
                                                      pass.gamma,     pass.llr,   pass.extrinsic};
    const std::vector<Signal> all = signals();
    for (std::uint32_t step = 0; step < pass.steps; ++step) {
        unsigned column = 0;
        for (std::size_t signal = 0; signal < words.size(); ++signal) {
            for (unsigned i = 0; i < all[signal].width; ++i) {
                take(step, column++, words[signal][std::size_t{step} * all[signal].width + i]);
            }
        }
    }
}

}  // namespace quarzel::tool

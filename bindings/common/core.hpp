// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <atomic>
#include <cstdint>
#include <functional>
#include <memory>
#include <span>
#include <string>
#include <string_view>

#include "outcome.hpp"
#include "soft_block.hpp"
#include "vardel_ip_quarzel.h"

namespace quarzel::bindings {

/// Names of the algorithm types, in their order.
inline constexpr std::array<const char*, 3> algorithmNames = {"max-log", "scaled-max-log", "max-star"};

/// The number of an algorithm type that is given by its name.
/// @throws BindingError listing the names when it is none of them
int algorithmOf(std::string_view name);

/// How a core is configured.
struct CoreSettings {
    int units = 2;      ///< processing units: 2, 4 or 8
    int algorithm = 1;  ///< 0 max-log, 1 max-log with extrinsic values scaled by 0.75, 2 max-star
    int tagWidth = 8;   ///< 0 to 32 bits
};

/// A model of one core for a host that may do anything at any time: nothing is thrown, a call during another
/// one is refused, and so is one after the end.
class Core {
  public:
    /// Asked between groups of blocks whether to stop; called on the thread that decodes.
    using Interrupted = std::function<bool()>;

    Core() = default;
    Core(const Core&) = delete;
    Core& operator=(const Core&) = delete;

    /// Make the model. To be called once, first.
    Outcome open(const CoreSettings& settings) noexcept;

    /// Free the model. Good to call again.
    Outcome close() noexcept;

    /// Decode blocks of any sizes, as one batch.
    /// @param blocks      receive bits and tags; when the outcome is a fault, what they hold is undefined
    /// @param iterations  1 to 15
    Outcome decode(std::span<SoftBlock> blocks, int iterations, const Interrupted& interrupted = {}) noexcept;

    /// Decode a block and keep the trace of its first passes.
    /// @param passes  passes to trace, two an iteration; more than there are mean all of them
    /// @param text    receives the trace in its text form
    Outcome trace(SoftBlock& block, int iterations, unsigned passes, std::string& text) noexcept;

  private:
    struct Destroy {
        void operator()(vardel_ip_quarzel_state* state) const { vardel_ip_quarzel_destroy_state(state); }
    };

    std::atomic<bool> itsBusy = false;
    std::unique_ptr<vardel_ip_quarzel_state, Destroy> itsState;
};

/// K of a block with this many positions.
/// @throws BindingError naming the nearest valid numbers
std::uint32_t blockSizeOf(std::size_t positions);

}  // namespace quarzel::bindings

// SPDX-License-Identifier: MIT
#pragma once

#include <atomic>
#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <variant>

#include "outcome.hpp"
#include "quarzel/core.hpp"

namespace quarzel::bindings {

/// Blocks of one size in arrays of a host.
using ArrayBlocks = std::variant<SoftBlocks<std::int8_t>, SoftBlocks<std::int16_t>, SoftBlocks<std::int32_t>>;

/// Blocks of one size to be decoded.
struct DecodeJob {
    ArrayBlocks blocks;
    int iterations;                 ///< 1 to 15
    std::span<unsigned char> bits;  ///< receives (blocks, K) decisions, 0 or 1
    std::span<unsigned> tags = {};  ///< one for each block, comes back masked; may be empty
    bool everyIteration = false;    ///< bits receives (blocks, iterations, K) decisions
};

/// The model of a core for a host that may call it at any time and from any thread. Nothing is thrown, a call
/// during another one is refused, and so is a call after the end. When a call fails, what it was to fill is
/// undefined.
class HostCore {
  public:
    /// Asked between groups of blocks whether to stop; called on the thread that decodes.
    using Interrupted = std::function<bool()>;

    HostCore() = default;
    HostCore(const HostCore&) = delete;
    HostCore& operator=(const HostCore&) = delete;

    /// Make the model. To be called once, first.
    /// @param implementation  one of `implementations()`; empty: the best one
    Outcome open(const CoreSettings& settings, const std::string& implementation = {}) noexcept;

    /// Free the model. It may be called again.
    Outcome close() noexcept;

    /// The implementation that was chosen.
    const std::string& implementation() const { return itsImplementation; }

    /// Decode blocks of one size.
    Outcome decode(const DecodeJob& job, const Interrupted& interrupted = {}) noexcept;

    /// Decode blocks of any sizes, as a batch.
    Outcome decodeBatch(std::span<const vardel_ip_quarzel_inputs> inputs,
                        std::span<vardel_ip_quarzel_outputs> outputs,
                        const Interrupted& interrupted = {}) noexcept;

    /// Decode a block, with the trace of its first passes as text in the outcome.
    /// @param passes  two an iteration; more than there are mean all of them
    Outcome traceText(const DecodeJob& block, unsigned passes) noexcept;

    /// Decode a block and hand its first passes to a handler.
    /// @param passes  two an iteration; more than there are mean all of them
    Outcome tracePasses(const DecodeJob& block, unsigned passes, const Core::PassHandler& handler) noexcept;

  private:
    template <class Work>
    Outcome use(Work work) noexcept;

    std::atomic<bool> itsBusy = false;
    std::optional<Core> itsCore;
    std::string itsImplementation;
};

/// The number of an algorithm type that is given by its name.
/// @throws std::invalid_argument listing the names when it is none of them
int algorithmOf(std::string_view name);

/// K of a block with this many positions.
/// @throws BindingError naming the nearest valid numbers
std::uint32_t blockSizeOf(std::size_t positions);

/// @throws BindingError unless the core can do so many iterations
void checkIterations(int iterations);

}  // namespace quarzel::bindings

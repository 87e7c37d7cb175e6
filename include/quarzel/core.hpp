// SPDX-License-Identifier: MIT
#ifndef QUARZEL_CORE_HPP
#define QUARZEL_CORE_HPP

#include <algorithm>
#include <concepts>
#include <cstddef>
#include <cstdint>
#include <exception>
#include <functional>
#include <iostream>
#include <memory>
#include <new>
#include <span>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "quarzel/code.hpp"
#include "quarzel/quantise.hpp"
#include "vardel_ip_quarzel.h"

/// The model for C++: a class over vardel_ip_quarzel.h, which tells what a soft value and a code block are.
namespace quarzel {

/// How a core is configured.
struct CoreSettings {
    int units = 2;      ///< processing units: 2, 4 or 8
    int algorithm = 1;  ///< 0 max-log, 1 max-log with extrinsic values scaled by 0.75, 2 max-star
    int tagWidth = 8;   ///< 0 to 32 bits
};

/// The model refused, and said why.
class Error : public std::runtime_error {
  public:
    /// @param text    what it said, without "ERROR:decoder:"
    /// @param status  of the call: 1 wrong argument, 2 block refused, 99 out of memory
    /// @param block   number of the block in its call, from 0
    explicit Error(const std::string& text, int status = 1, std::size_t block = 0)
        : std::runtime_error(text), itsStatus(status), itsBlock(block) {}

    int status() const noexcept { return itsStatus; }
    std::size_t block() const noexcept { return itsBlock; }

  private:
    int itsStatus;
    std::size_t itsBlock;
};

enum class MessageKind {
    error = VARDEL_IP_QUARZEL_ERROR,
    warning = VARDEL_IP_QUARZEL_WARNING,
    trace = VARDEL_IP_QUARZEL_TRACE,
};

/// A line without its kind and component: "WARNING:decoder:Text" becomes "Text".
inline std::string_view plainText(std::string_view line) {
    for (int part = 0; part < 2; ++part) {
        line.remove_prefix(std::min(line.find(':') + 1, line.size()));
    }
    return line;
}

/// How an array holds soft values.
template <class Value>
concept SoftValue = std::same_as<Value, std::int8_t> || std::same_as<Value, std::int16_t> ||
    std::same_as<Value, std::int32_t>;

/// Blocks of one size in arrays of the caller's. Strides are counted in values.
template <SoftValue Value>
struct SoftBlocks {
    const Value* systematic;  ///< position 0 of block 0
    const Value* parity1;
    const Value* parity2;
    std::size_t count;      ///< blocks
    std::size_t positions;  ///< of a block: K + 4
    std::ptrdiff_t blockStride;
    std::ptrdiff_t positionStride = 1;
};

/// Blocks that lie after one another, each with its streams after one another: shape (count, 3, positions).
/// @throws std::invalid_argument when the values are not whole blocks
template <SoftValue Value>
SoftBlocks<Value> softBlocks(std::span<const Value> values, std::size_t positions) {
    if (positions == 0 || values.size() % (3 * positions) != 0) {
        throw std::invalid_argument(std::to_string(values.size()) +
                                    " soft values are not whole blocks of 3 x " + std::to_string(positions));
    }
    return {values.data(),
            values.data() + positions,
            values.data() + 2 * positions,
            values.size() / (3 * positions),
            positions,
            static_cast<std::ptrdiff_t>(3 * positions)};
}

/// A model of one core.
///
/// Errors are thrown; warnings and traces go to a handler or, where there is none, to the standard output
/// stream. What a handler throws leaves through the call that was at work, once it is done.
///
/// Thread rule: one thread at a time; different cores are independent.
class Core {
  public:
    /// @param text  the whole line, without its line end
    using MessageHandler = std::function<void(MessageKind kind, std::string_view text)>;
    using PassHandler = std::function<void(const vardel_ip_quarzel_pass& pass)>;

    /// @throws Error           when the settings are wrong
    /// @throws std::bad_alloc  when there is no memory
    explicit Core(const CoreSettings& settings = {}, MessageHandler handler = {})
        : Core(std::make_unique<Ports>(std::move(handler)), genericsOf(settings)) {}

    /// A core with generics of the C interface.
    static Core withGenerics(const vardel_ip_quarzel_generics& generics, MessageHandler handler = {}) {
        return Core(std::make_unique<Ports>(std::move(handler)), generics);
    }

    /// The record of the C interface for some settings; all else as by default.
    static vardel_ip_quarzel_generics genericsOf(const CoreSettings& settings) {
        vardel_ip_quarzel_generics generics;
        vardel_ip_quarzel_get_default_generics(&generics);
        generics.C_NUM_PU = settings.units;
        generics.C_ALGORITHM_TYPE = settings.algorithm;
        generics.C_TAG_WIDTH = settings.tagWidth;
        return generics;
    }

    /// Send warnings and traces elsewhere from now on.
    void onMessage(MessageHandler handler) { itsPorts->onMessage = std::move(handler); }

    /// Decode one block.
    /// @param bits  receives K decisions, 0 or 1
    /// @return      the tag, masked to the tag width
    /// @throws Error, std::invalid_argument when the streams are not of one length
    unsigned decode(std::span<const int> systematic, std::span<const int> parity1,
                    std::span<const int> parity2, int iterations, std::span<unsigned char> bits,
                    unsigned tag = 0) {
        if (parity1.size() != systematic.size() || parity2.size() != systematic.size()) {
            throw std::invalid_argument("the three streams must be of one length");
        }
        vardel_ip_quarzel_outputs outputs{bits.data(), static_cast<int>(bits.size()), 0, 0};
        const int status =
            vardel_ip_quarzel_bitacc_simulate(itsState.get(), &outputs,
                                              {systematic.data(), parity1.data(), parity2.data(),
                                               static_cast<int>(systematic.size()), iterations, tag});
        itsPorts->finish(status, 0);
        return outputs.tag;
    }

    /// Decode blocks of any sizes, as a batch.
    /// @throws Error for the first block that failed, when all are done; std::invalid_argument when there are
    ///         not as many outputs as inputs
    void decode(std::span<const vardel_ip_quarzel_inputs> inputs,
                std::span<vardel_ip_quarzel_outputs> outputs) {
        if (outputs.size() != inputs.size()) {
            throw std::invalid_argument("there must be one output for each input");
        }
        itsStatuses.resize(inputs.size());
        const int status =
            vardel_ip_quarzel_bitacc_simulate_batch(itsState.get(), outputs.data(), inputs.data(),
                                                    static_cast<int>(inputs.size()), itsStatuses.data());
        itsPorts->finish(status, firstFailure());
    }

    /// Decode blocks of one size.
    /// @param bits  receives (count, K) decisions
    /// @param tags  a tag for each block, which comes back masked; may be empty
    /// @throws Error for the first block that failed, when all are done; std::invalid_argument when bits or
    ///         tags are not as many as the blocks need
    template <SoftValue Value>
    void decode(const SoftBlocks<Value>& blocks, int iterations, std::span<unsigned char> bits,
                std::span<unsigned> tags = {}) {
        decodeArray(blocks, iterations, 1, bits, tags);
    }

    /// Decode blocks of one size, with the decisions after every iteration of the one decode.
    /// @param bits  receives (count, iterations, K) decisions
    template <SoftValue Value>
    void decodeEveryIteration(const SoftBlocks<Value>& blocks, int iterations, std::span<unsigned char> bits,
                              std::span<unsigned> tags = {}) {
        decodeArray(blocks, iterations, static_cast<std::size_t>(std::max(iterations, 1)), bits, tags);
    }

    /// Write the text trace of the next passes, as messages.
    void trace(unsigned passes) { vardel_ip_quarzel_bitacc_dump_config(itsState.get(), passes); }

    /// Hand the next passes to a handler, as arrays of integers; 0 ends it.
    /// @throws std::bad_alloc when there is no memory
    void passes(unsigned count, PassHandler handler) {
        itsPorts->onPass = std::move(handler);
        if (vardel_ip_quarzel_set_passes(itsState.get(), count, takePass, itsPorts.get()) != 0) {
            itsPorts->errors.clear();
            throw std::bad_alloc();
        }
    }

    /// The implementation that has been chosen, the best one at first.
    std::string_view implementation() const { return vardel_ip_quarzel_get_implementation(itsState.get()); }

    /// Choose one of `implementations()`.
    /// @throws Error when this machine has no such implementation
    void choose(const std::string& implementation) {
        itsPorts->finish(vardel_ip_quarzel_set_implementation(itsState.get(), implementation.c_str()), 0);
    }

    /// The state of the C interface; it stays the core's.
    vardel_ip_quarzel_state* state() const { return itsState.get(); }

  private:
    struct DestroyState {
        void operator()(vardel_ip_quarzel_state* state) const { vardel_ip_quarzel_destroy_state(state); }
    };

    /// What the receivers of the C interface write to. It stays where it is when a core moves.
    struct Ports {
        explicit Ports(MessageHandler handler) : onMessage(std::move(handler)) {}

        MessageHandler onMessage;
        PassHandler onPass;
        std::string errors;            ///< of the call at work, a line each
        std::exception_ptr exception;  ///< what a handler threw first

        /// Throw what there is to throw at the end of a call.
        void finish(int status, std::size_t block) {
            const std::string text = std::exchange(errors, {});
            if (exception) {
                std::rethrow_exception(std::exchange(exception, nullptr));
            }
            if (status != 0) {
                throw Error(text, status, block);
            }
        }

        /// A receiver must not throw. Once a handler has thrown, none is called again before the call ends.
        template <class Work>
        void guard(Work work) noexcept {
            if (exception) {
                return;
            }
            try {
                work();
            } catch (...) {
                exception = std::current_exception();
            }
        }
    };

    Core(std::unique_ptr<Ports> ports, const vardel_ip_quarzel_generics& generics)
        : itsPorts(std::move(ports)) {
        itsState.reset(vardel_ip_quarzel_create_state_with_messages(&generics, takeMessage, itsPorts.get()));
        if (itsState == nullptr) {
            if (vardel_ip_quarzel_check_generics(&generics) == nullptr) {
                throw std::bad_alloc();
            }
            itsPorts->finish(1, 0);
        }
    }

    static void takeMessage(void* cookie, int kind, const char* text) {
        auto& ports = *static_cast<Ports*>(cookie);
        ports.guard([&] {
            if (kind == VARDEL_IP_QUARZEL_ERROR) {
                ports.errors.append(ports.errors.empty() ? "" : "\n").append(plainText(text));
            } else if (ports.onMessage) {
                ports.onMessage(static_cast<MessageKind>(kind), text);
            } else {
                std::cout << text << std::endl;
            }
        });
    }

    static void takePass(void* cookie, const vardel_ip_quarzel_pass* pass) {
        auto& ports = *static_cast<Ports*>(cookie);
        ports.guard([&] { ports.onPass(*pass); });
    }

    std::size_t firstFailure() const {
        const auto failed =
            std::find_if(itsStatuses.begin(), itsStatuses.end(), [](int s) { return s != 0; });
        return static_cast<std::size_t>(failed - itsStatuses.begin());
    }

    template <SoftValue Value>
    void decodeArray(const SoftBlocks<Value>& blocks, int iterations, std::size_t decisions,
                     std::span<unsigned char> bits, std::span<unsigned> tags) {
        const std::size_t K = blocks.positions > tailPositions ? blocks.positions - tailPositions : 0;
        if (bits.size() != blocks.count * decisions * K) {
            throw std::invalid_argument("there must be room for " +
                                        std::to_string(blocks.count * decisions * K) + " decisions, not " +
                                        std::to_string(bits.size()));
        }
        if (!tags.empty() && tags.size() != blocks.count) {
            throw std::invalid_argument("there must be one tag for each block");
        }
        unsigned* const tagPlace = tags.empty() ? nullptr : tags.data();
        const vardel_ip_quarzel_array_inputs inputs{blocks.systematic,
                                                    blocks.parity1,
                                                    blocks.parity2,
                                                    blocks.blockStride,
                                                    blocks.positionStride,
                                                    static_cast<int>(sizeof(Value)),
                                                    static_cast<int>(blocks.positions),
                                                    static_cast<int>(blocks.count),
                                                    iterations,
                                                    tagPlace};
        const vardel_ip_quarzel_array_outputs outputs{bits.data(), static_cast<std::ptrdiff_t>(decisions * K),
                                                      decisions > 1 ? static_cast<std::ptrdiff_t>(K) : 0,
                                                      tagPlace};
        itsStatuses.resize(blocks.count);
        const int status =
            vardel_ip_quarzel_bitacc_simulate_array(itsState.get(), &outputs, &inputs, itsStatuses.data());
        itsPorts->finish(status, firstFailure());
    }

    std::unique_ptr<Ports> itsPorts;
    std::unique_ptr<vardel_ip_quarzel_state, DestroyState> itsState;
    std::vector<int> itsStatuses;
};

}  // namespace quarzel

#endif

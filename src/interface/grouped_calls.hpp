// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <array>
#include <cstring>
#include <span>
#include <tuple>
#include <vector>

#include "decoder/decoder.hpp"
#include "interface/block_call.hpp"
#include "interface/lane_implementation.hpp"

namespace quarzel {

/// Many blocks by one call: the effect of a call of simulate for each, in their order, with blocks of equal
/// size and iterations decoded together.
///
/// Every message comes where the calls would have given it: before another one is written, that of a
/// saturated value in the blocks up to there is.
///
/// @tparam Source  as for simulateBlock
template <class Source>
class GroupedCalls {
  public:
    /// @param statuses  receives one for each block
    GroupedCalls(vardel_ip_quarzel_state& state, const Source& source, std::span<int> statuses)
        : itsState(state), itsSource(source), itsStatuses(statuses) {}

    /// @return the first status that is not 0, or 0
    int run() {
        std::fill(itsStatuses.begin(), itsStatuses.end(), pending);
        try {
            runTogether();
        } catch (...) {
            // Where there is no memory for decoding together, what is left is decoded block by block.
            runOneByOne();
        }
        const auto failed =
            std::find_if(itsStatuses.begin(), itsStatuses.end(), [](int status) { return status != 0; });
        return failed == itsStatuses.end() ? 0 : *failed;
    }

  private:
    /// A block that waits for others like it.
    struct Waiting {
        unsigned size;
        int iterations;
        int index;

        bool operator<(const Waiting& other) const {
            return std::tie(size, iterations, index) < std::tie(other.size, other.iterations, other.index);
        }
        bool isLike(const Waiting& other) const {
            return size == other.size && iterations == other.iterations;
        }
    };

    /// A status that no call gives: the block has not been decided on yet.
    static constexpr int pending = -1;

    /// Blocks that are handed to the lanes at once: enough for the widest vectors, few enough to stay in the
    /// first-level cache.
    static constexpr std::size_t handful = 256;

    void runTogether() {
        itsWaiting.reserve(std::min(itsStatuses.size(), handful));
        for (int i = 0; i < static_cast<int>(itsStatuses.size()); ++i) {
            const BlockCall call = itsSource.block(i);
            if (findFault(call) != nullptr) {
                reportWaitingSaturation();
                itsStatuses[static_cast<std::size_t>(i)] = simulateBlock(itsState, itsSource, i);
            } else if (canWait(call)) {
                if (itsWaiting.size() == handful && areAlike()) {
                    decodeWaiting();
                }
                itsWaiting.push_back({blockSize(call), call.iterations, i});
                if (truncates(itsState, call.tag)) {
                    reportWaitingSaturation();
                    reportTruncation(itsState, call.tag);
                }
            } else {
                decodeWaiting();
                itsStatuses[static_cast<std::size_t>(i)] = simulateBlock(itsState, itsSource, i);
                itsSizeThatFits = 0;
            }
        }
        decodeWaiting();
    }

    void runOneByOne() {
        for (int i = 0; i < static_cast<int>(itsStatuses.size()); ++i) {
            int& status = itsStatuses[static_cast<std::size_t>(i)];
            if (status == pending) {
                status = simulateBlock(itsState, itsSource, i);
            } else if (status == 0) {
                reportSaturation(itsState, itsSource.block(i));
            }
        }
    }

    /// Whether lanes may decode the block. Nothing but a literal decode changes the answer for a size.
    bool canWait(const BlockCall& call) {
        const unsigned K = blockSize(call);
        if (K == 0 || !hasRoom(call, K)) {
            return false;
        }
        if (K != itsSizeThatFits) {
            if (!takesLanes(itsState, K)) {
                return false;
            }
            itsSizeThatFits = K;
        }
        return true;
    }

    void reportWaitingSaturation() const {
        for (const Waiting& block : itsWaiting) {
            reportSaturation(itsState, itsSource.block(block.index));
        }
    }

    /// Decode all that wait. Sizes are taken in the order of their last blocks, so that what is kept of the
    /// blocks for a later trace is what the order of the calls would have left.
    void decodeWaiting() {
        bool saturated = false;
        if (areAlike()) {
            saturated = decodeLike(itsWaiting);
        } else {
            itsSorted = itsWaiting;
            std::sort(itsSorted.begin(), itsSorted.end());
            itsClasses.clear();
            for (auto first = itsSorted.begin(); first != itsSorted.end();) {
                const auto end = std::find_if(
                    first, itsSorted.end(), [first](const Waiting& block) { return !block.isLike(*first); });
                itsClasses.emplace_back(first, end);
                first = end;
            }
            std::sort(itsClasses.begin(), itsClasses.end(),
                      [](const auto& x, const auto& y) { return x.back().index < y.back().index; });
            for (const std::span<const Waiting>& blocks : itsClasses) {
                saturated |= decodeLike(blocks);
            }
        }
        if (saturated) {
            reportWaitingSaturation();
        }
        itsWaiting.clear();
    }

    bool areAlike() const {
        return std::all_of(itsWaiting.begin(), itsWaiting.end(),
                           [this](const Waiting& block) { return block.isLike(itsWaiting.front()); });
    }

    /// Decode blocks of one size.
    /// @return whether a value was saturated
    bool decodeLike(std::span<const Waiting> blocks) {
        bool saturated = false;
        while (!blocks.empty()) {
            const std::span<const Waiting> some = blocks.first(std::min(blocks.size(), handful));
            saturated |= decodeHandful(some);
            blocks = blocks.subspan(some.size());
        }
        return saturated;
    }

    bool decodeHandful(std::span<const Waiting> blocks) {
        const BlockCall first = itsSource.block(blocks.front().index);
        const std::size_t K = blockSize(first);
        const auto valueBytes = static_cast<std::size_t>(first.valueType);
        if (first.positionStride != 1) {
            itsStaged.resize(blocks.size() * 3 * (K + 4) * valueBytes);
        }
        for (std::size_t i = 0; i < blocks.size(); ++i) {
            const BlockCall call = itsSource.block(blocks[i].index);
            itsLaneBlocks[i] = {{call.streams[0], call.streams[1], call.streams[2]}, call.dout};
            if (call.positionStride != 1) {
                stage(call, itsStaged.data() + i * 3 * (K + 4) * valueBytes, itsLaneBlocks[i]);
            }
        }
        const bool saturated = itsState.lanes->decode(
            itsState, static_cast<std::uint32_t>(K),
            {std::span<const LaneBlock>(itsLaneBlocks).first(blocks.size()), valueBytes,
             static_cast<unsigned>(first.iterations), first.iterationStride});
        for (const Waiting& block : blocks) {
            itsStatuses[static_cast<std::size_t>(block.index)] = 0;
            itsSource.finish(block.index, K, itsSource.block(block.index).tag & itsState.tag_mask);
        }
        return saturated;
    }

    /// Lanes read the positions of a stream one after the other: bring them there.
    static void stage(const BlockCall& call, unsigned char* to, LaneBlock& block) {
        const auto valueBytes = static_cast<std::size_t>(call.valueType);
        for (const void*& stream : block.streams) {
            const auto* from = static_cast<const unsigned char*>(stream);
            stream = to;
            for (int position = 0; position < call.size; ++position) {
                std::memcpy(to, from + position * call.positionStride * call.valueType, valueBytes);
                to += valueBytes;
            }
        }
    }

    vardel_ip_quarzel_state& itsState;
    const Source& itsSource;
    std::span<int> itsStatuses;
    unsigned itsSizeThatFits = 0;
    std::vector<Waiting> itsWaiting;  ///< in the order of the calls
    std::vector<Waiting> itsSorted;
    std::vector<std::span<const Waiting>> itsClasses;
    std::vector<unsigned char> itsStaged;
    std::array<LaneBlock, handful> itsLaneBlocks;
};

/// Decode all blocks of a source.
/// @param statuses  receives them; may be null
/// @return          the first status that is not 0, or 0
template <class Source>
int simulateAll(vardel_ip_quarzel_state& state, const Source& source, int count, int* statuses) {
    try {
        std::vector<int> ownStatuses;
        if (statuses == nullptr) {
            ownStatuses.resize(static_cast<std::size_t>(count));
            statuses = ownStatuses.data();
        }
        return GroupedCalls<Source>(state, source, {statuses, static_cast<std::size_t>(count)}).run();
    } catch (...) {
        // Out of memory for the statuses themselves: no block was looked at.
        return unhandledException(state.messages);
    }
}

}  // namespace quarzel

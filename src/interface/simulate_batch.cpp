// SPDX-License-Identifier: MIT
#include <algorithm>
#include <span>
#include <tuple>
#include <vector>

#include "decoder/decoder.hpp"
#include "interface/block_call.hpp"
#include "interface/messages.hpp"
#include "interface/overlap.hpp"

namespace quarzel {

namespace {

/// A status that no call gives: the block has not been decided on yet.
constexpr int pending = -1;

/// The arrays of a batch.
struct Batch {
    vardel_ip_quarzel_state* state;
    vardel_ip_quarzel_outputs* outputs;
    const vardel_ip_quarzel_inputs* inputs;
    int* statuses;
};

/// Blocks that wait for others of their size, to be decoded together.
class WaitingBlocks {
  public:
    WaitingBlocks(const Batch& batch, int count) : itsBatch(batch) {
        itsWaiting.reserve(static_cast<std::size_t>(count));
    }

    void add(int index) {
        const vardel_ip_quarzel_inputs& in = itsBatch.inputs[index];
        itsWaiting.push_back({blockSize(in), in.iterations, index});
    }

    /// Look for saturated values now, because something else is about to be said.
    void reportSaturation() const {
        for (const Block& block : itsWaiting) {
            quarzel::reportSaturation(*itsBatch.state, itsBatch.inputs[block.index]);
        }
    }

    /// Decode all that wait. Sizes are taken in the order of their last blocks, so that what the decoder
    /// keeps of the blocks is what the order of the calls would have left.
    void decode() {
        itsSorted = itsWaiting;
        if (!std::is_sorted(itsSorted.begin(), itsSorted.end())) {
            std::sort(itsSorted.begin(), itsSorted.end());
        }
        itsClasses.clear();
        for (auto first = itsSorted.begin(); first != itsSorted.end();) {
            const auto end = std::find_if(first, itsSorted.end(),
                                          [first](const Block& block) { return !block.isLike(*first); });
            itsClasses.emplace_back(first, end);
            first = end;
        }
        std::sort(itsClasses.begin(), itsClasses.end(),
                  [](const auto& x, const auto& y) { return x.back().index < y.back().index; });
        bool saturated = false;
        for (const std::span<const Block>& blocks : itsClasses) {
            saturated |= decode(blocks);
        }
        if (saturated) {
            reportSaturation();
        }
        itsWaiting.clear();
    }

  private:
    struct Block {
        unsigned size;
        int iterations;
        int index;

        bool operator<(const Block& other) const {
            return std::tie(size, iterations, index) < std::tie(other.size, other.iterations, other.index);
        }
        bool isLike(const Block& other) const { return size == other.size && iterations == other.iterations; }
    };

    bool decode(std::span<const Block> blocks) {
        itsLaneBlocks.clear();
        for (const Block& block : blocks) {
            itsLaneBlocks.push_back(laneBlock(itsBatch.outputs[block.index], itsBatch.inputs[block.index]));
        }
        const auto [size, iterations, first] = blocks.front();
        const bool saturated =
            itsBatch.state->decoder->decodeLanes(size, static_cast<unsigned>(iterations), itsLaneBlocks);
        for (const Block& block : blocks) {
            itsBatch.statuses[block.index] = 0;
            fillRecord(*itsBatch.state, itsBatch.outputs[block.index], itsBatch.inputs[block.index], size);
        }
        return saturated;
    }

    const Batch& itsBatch;
    std::vector<Block> itsWaiting;  ///< in the order of the calls
    std::vector<Block> itsSorted;
    std::vector<std::span<const Block>> itsClasses;
    std::vector<LaneBlock> itsLaneBlocks;
};

int simulateOne(const Batch& batch, int index) {
    return vardel_ip_quarzel_bitacc_simulate(batch.state, &batch.outputs[index], batch.inputs[index]);
}

/// Every message comes where the calls would have given it: before one, the saturation that blocks before it
/// would have told is told.
void simulateEach(const Batch& batch, int count) {
    const bool together = !outputsOverlap(batch.outputs, batch.inputs, count);
    WaitingBlocks waiting(batch, count);
    for (int i = 0; i < count; ++i) {
        const vardel_ip_quarzel_inputs& in = batch.inputs[i];
        if (findFault(batch.state, &batch.outputs[i], in) != nullptr) {
            waiting.reportSaturation();
            batch.statuses[i] = simulateOne(batch, i);
        } else if (together && takesLanes(*batch.state, batch.outputs[i], in)) {
            waiting.add(i);
            if (truncates(*batch.state, in)) {
                waiting.reportSaturation();
                reportTruncation(*batch.state, in);
            }
        } else {
            waiting.decode();
            batch.statuses[i] = simulateOne(batch, i);
        }
    }
    waiting.decode();
}

/// Where there is no memory for decoding together, what is left is decoded block by block.
void simulateAll(const Batch& batch, int count) {
    try {
        simulateEach(batch, count);
    } catch (...) {
        for (int i = 0; i < count; ++i) {
            if (batch.statuses[i] == pending) {
                batch.statuses[i] = simulateOne(batch, i);
            } else if (batch.statuses[i] == 0) {
                reportSaturation(*batch.state, batch.inputs[i]);
            }
        }
    }
}

}  // namespace

}  // namespace quarzel

int vardel_ip_quarzel_bitacc_simulate_batch(vardel_ip_quarzel_state* state,
                                            vardel_ip_quarzel_outputs* outputs,
                                            const vardel_ip_quarzel_inputs* inputs, int count,
                                            int* statuses) {
    const auto refuse = [](const char* text) {
        quarzel::decoderError(text);
        return 1;
    };
    if (state == nullptr) {
        return refuse("Simulate batch called with null state structure");
    }
    if (count < 0) {
        return refuse("count must not be negative");
    }
    if (count == 0) {
        return 0;
    }
    if (outputs == nullptr) {
        return refuse("Simulate batch called with null output structures");
    }
    if (inputs == nullptr) {
        return refuse("Simulate batch called with null input structures");
    }
    try {
        std::vector<int> ownStatuses;
        if (statuses == nullptr) {
            ownStatuses.resize(static_cast<std::size_t>(count));
            statuses = ownStatuses.data();
        }
        const std::span all(statuses, static_cast<std::size_t>(count));
        std::fill(all.begin(), all.end(), quarzel::pending);
        quarzel::simulateAll({state, outputs, inputs, statuses}, count);
        const auto failed = std::find_if(all.begin(), all.end(), [](int status) { return status != 0; });
        return failed == all.end() ? 0 : *failed;
    } catch (...) {
        // Out of memory for the statuses themselves: no block was looked at.
        return quarzel::unhandledException();
    }
}

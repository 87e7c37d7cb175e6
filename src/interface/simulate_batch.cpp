// SPDX-License-Identifier: MIT
#include <algorithm>
#include <cstdint>
#include <map>
#include <span>
#include <utility>
#include <vector>

#include "decoder/decoder.hpp"
#include "interface/block_call.hpp"
#include "interface/messages.hpp"

namespace quarzel {

namespace {

/// A status that no call gives: the block has not been decided on yet.
constexpr int pending = -1;

constexpr const char* unhandledException = "Unhandled exception has occurred";

/// The arrays of a batch.
struct Batch {
    vardel_ip_quarzel_state* state;
    vardel_ip_quarzel_outputs* outputs;
    const vardel_ip_quarzel_inputs* inputs;
    int* statuses;
};

/// Bytes of the caller's, by their addresses.
struct Range {
    std::uintptr_t first = 0;
    std::uintptr_t end = 0;
    bool written = false;

    Range(const void* start, std::size_t bytes, bool isWritten)
        : first(reinterpret_cast<std::uintptr_t>(start)), end(first + bytes), written(isWritten) {}

    bool empty() const { return first == 0 || first == end; }
};

/// Call `visit` for the arrays of every block.
template <class Visit>
void forEachRange(const Batch& batch, int count, Visit visit) {
    for (int i = 0; i < count; ++i) {
        const auto& in = batch.inputs[i];
        const auto size = static_cast<std::size_t>(std::max(in.din_size, 0));
        for (const int* stream : {in.rsc1_sys, in.rsc1_par, in.rsc2_par}) {
            visit(Range(stream, size * sizeof(int), false));
        }
        // A block has 4 decisions fewer than soft values.
        visit(Range(batch.outputs[i].dout, size > 4 ? size - 4 : 0, true));
    }
}

/// Whether a buffer for decisions shares bytes with anything else of the batch. Then the order of the writes
/// shows, and the blocks have to be decoded one after the other.
bool outputsOverlap(const Batch& batch, int count) {
    // Most callers keep decisions and soft values apart, and the buffers in their order.
    std::uintptr_t readFirst = UINTPTR_MAX;
    std::uintptr_t readEnd = 0;
    std::uintptr_t writtenFirst = UINTPTR_MAX;
    std::uintptr_t writtenEnd = 0;
    bool ascending = true;
    forEachRange(batch, count, [&](const Range& range) {
        if (range.empty()) {
            return;
        }
        ascending = ascending && (!range.written || range.first >= writtenEnd);
        std::uintptr_t& first = range.written ? writtenFirst : readFirst;
        std::uintptr_t& end = range.written ? writtenEnd : readEnd;
        first = std::min(first, range.first);
        end = std::max(end, range.end);
    });
    if (ascending && (readEnd <= writtenFirst || writtenEnd <= readFirst)) {
        return false;
    }
    std::vector<Range> ranges;
    forEachRange(batch, count, [&](const Range& range) {
        if (!range.empty()) {
            ranges.push_back(range);
        }
    });
    std::sort(ranges.begin(), ranges.end(), [](const Range& x, const Range& y) { return x.first < y.first; });
    readEnd = writtenEnd = 0;
    return std::any_of(ranges.begin(), ranges.end(), [&](const Range& range) {
        const bool overlaps = range.first < writtenEnd || (range.written && range.first < readEnd);
        std::uintptr_t& end = range.written ? writtenEnd : readEnd;
        end = std::max(end, range.end);
        return overlaps;
    });
}

/// Blocks that wait for others of their size, to be decoded together.
class WaitingBlocks {
  public:
    explicit WaitingBlocks(const Batch& batch) : itsBatch(batch) {}

    void add(int index) {
        const vardel_ip_quarzel_inputs& in = itsBatch.inputs[index];
        itsClasses[{blockSize(in), in.iterations}].push_back(index);
    }

    /// Decode all that wait. Sizes are taken in the order of their last blocks, so that what the decoder
    /// keeps of the blocks is what the order of the calls would have left.
    void decode() {
        std::vector<const Class*> order;
        for (const Class& blocks : itsClasses) {
            order.push_back(&blocks);
        }
        std::sort(order.begin(), order.end(),
                  [](const Class* x, const Class* y) { return x->second.back() < y->second.back(); });
        for (const Class* blocks : order) {
            decode(*blocks);
        }
        itsClasses.clear();
    }

  private:
    using Class = std::pair<const std::pair<unsigned, int>, std::vector<int>>;

    void decode(const Class& blocks) {
        const auto& [size, iterations] = blocks.first;
        itsBlocks.clear();
        for (const int index : blocks.second) {
            itsBlocks.push_back(laneBlock(itsBatch.outputs[index], itsBatch.inputs[index]));
        }
        int status = 0;
        try {
            itsBatch.state->decoder->decodeLanes(size, static_cast<unsigned>(iterations), itsBlocks);
        } catch (...) {
            status = 99;
        }
        for (const int index : blocks.second) {
            itsBatch.statuses[index] = status;
            if (status == 0) {
                fillRecord(*itsBatch.state, itsBatch.outputs[index], itsBatch.inputs[index], size);
            } else {
                decoderError(unhandledException);
            }
        }
    }

    const Batch& itsBatch;
    std::map<std::pair<unsigned, int>, std::vector<int>> itsClasses;
    std::vector<LaneBlock> itsBlocks;
};

void simulateEach(const Batch& batch, int count) {
    const bool together = !outputsOverlap(batch, count);
    WaitingBlocks waiting(batch);
    for (int i = 0; i < count; ++i) {
        const vardel_ip_quarzel_inputs& in = batch.inputs[i];
        if (const char* fault = findFault(batch.state, &batch.outputs[i], in)) {
            decoderError(fault);
            batch.statuses[i] = 1;
        } else if (together && takesLanes(*batch.state, batch.outputs[i], in)) {
            // Everything that a block says, it says here, in the order of the calls.
            reportSaturation(*batch.state, in);
            reportTruncation(*batch.state, in);
            waiting.add(i);
        } else {
            waiting.decode();
            batch.statuses[i] = vardel_ip_quarzel_bitacc_simulate(batch.state, &batch.outputs[i], in);
        }
    }
    waiting.decode();
}

/// The blocks that an exception leaves undecided get the status that a call for each would have given.
void simulateAll(const Batch& batch, int count) {
    try {
        simulateEach(batch, count);
    } catch (...) {
        for (int i = 0; i < count; ++i) {
            if (batch.statuses[i] == pending) {
                batch.statuses[i] = 99;
                decoderError(unhandledException);
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
        quarzel::decoderError(quarzel::unhandledException);
        return 99;
    }
}

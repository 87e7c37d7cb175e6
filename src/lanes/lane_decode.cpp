// SPDX-License-Identifier: MIT
#include "lanes/lane_decode.hpp"

#include <algorithm>
#include <memory>

namespace quarzel {

using lanes::LaneGroup;
using lanes::sliceLanes;

namespace {

/// What a lane without a block decodes: as many zeros as a segment has steps and tail values, and more.
constexpr std::int32_t silence[1024] = {};

/// Values of each stream after those of the steps.
constexpr std::uint32_t tailValues = 4;

constexpr std::size_t states = 8;

/// Most segments that a block of up to 6144 bits is cut into.
constexpr std::uint32_t maxSegments = 64;

}  // namespace

bool LaneDecoder::add(const LaneSchedule& schedule) {
    const auto K = static_cast<std::uint32_t>(schedule.permutation.size());
    const std::uint32_t segments = schedule.segments;
    if (segments > maxSegments || K % segments != 0 || K / segments + tailValues > std::size(silence)) {
        return false;
    }
    auto layout = makeLaneLayout(schedule, itsShuffles);
    if (!layout) {
        return false;
    }
    itsLayouts.emplace(K, std::move(*layout));
    return true;
}

/// Fill the widest vectors: with the same slice of several bundles, else with the slices of one. A block of
/// one segment that is alone fills them with its states.
LaneDecoder::Plan LaneDecoder::plan(const LaneLayout& layout, std::size_t blocks) const {
    const std::size_t bundles = (blocks + layout.blocksPerBundle() - 1) / layout.blocksPerBundle();
    const lanes::LaneKernel& narrowest = itsCandidate->kernels[0];
    if (blocks == 1 && layout.segments == 1 && narrowest.alone[itsAlgorithm] != nullptr) {
        return {&narrowest, Fill::states, 1};
    }
    Plan best{&narrowest, Fill::bundles, 1};
    for (std::size_t i = 1; i < itsCandidate->kernelCount; ++i) {
        const lanes::LaneKernel& kernel = itsCandidate->kernels[i];
        const std::size_t slots = kernel.width / sliceLanes;
        if (bundles >= slots) {
            best = {&kernel, Fill::bundles, static_cast<std::uint32_t>(slots)};
        } else if (layout.slices() % slots == 0) {
            best = {&kernel, Fill::slices, 1};
        }
    }
    return best;
}

bool LaneDecoder::decode(std::uint32_t K, const LaneCall& call) {
    const LaneLayout& layout = itsLayouts.at(K);
    bool saturated = false;
    LaneCall rest = call;
    while (!rest.blocks.empty()) {
        const Plan group = plan(layout, rest.blocks.size());
        const std::size_t count =
            std::min<std::size_t>(rest.blocks.size(), std::size_t{group.bundles} * layout.blocksPerBundle());
        LaneCall part = call;
        part.blocks = rest.blocks.first(count);
        saturated |= decodeGroup(layout, group, part);
        rest.blocks = rest.blocks.subspan(count);
    }
    return saturated;
}

/// Give a group its parts of the store, each on a cache line of its own.
void LaneDecoder::shareStore(const LaneLayout& layout, const Plan& plan) {
    constexpr std::size_t line = 64;
    constexpr std::size_t lineWords = line / sizeof(std::int16_t);
    const bool alone = plan.fill == Fill::states;
    const std::size_t row = alone ? 1 : sliceLanes * layout.slices() * plan.bundles;
    // Single words are written eight at a time.
    const std::size_t stream = layout.steps * row + (alone ? sliceLanes : 0);
    const std::size_t betaRows = layout.windowLength.size() * states;
    const struct {
        std::int16_t** part;
        std::size_t words;
    } parts[] = {
        {&itsGroup.systematic, stream},
        {&itsGroup.parity[0], stream},
        {&itsGroup.parity[1], stream},
        {&itsGroup.tail, lanes::tailSlices * sliceLanes * itsGroup.bundles},
        {&itsGroup.channel, stream},
        {&itsGroup.llr, itsGroup.iterationStride == 0 ? 0 : stream},
        {&itsGroup.extrinsic, stream},
        {&itsGroup.alphaState, 2 * states * row},
        {&itsGroup.alphaStart[0], states * row},
        {&itsGroup.alphaStart[1], states * row},
        {&itsGroup.betaStart[0], betaRows * row},
        {&itsGroup.betaStart[1], betaRows * row},
        {&itsGroup.boundary, states * row},
        {&itsGroup.stepRows, lanes::maxWindow * lanes::maxStepVectors * plan.kernel->width},
    };
    const auto rounded = [](std::size_t words) { return (words + lineWords - 1) / lineWords * lineWords; };
    std::size_t needed = lineWords;
    for (const auto& [part, words] : parts) {
        needed += rounded(words);
    }
    if (itsStore.size() < needed) {
        itsStore.resize(needed);
    }
    void* first = itsStore.data();
    std::size_t space = needed * sizeof(std::int16_t);
    auto* next = static_cast<std::int16_t*>(std::align(line, space - line, first, space));
    for (const auto& [part, words] : parts) {
        *part = next;
        next += rounded(words);
    }
    if (itsGroup.iterationStride == 0) {
        itsGroup.llr = itsGroup.channel;
    }
}

/// Point the lanes of a block to its values.
void LaneDecoder::placeBlock(const LaneLayout& layout, const LaneBlock& block, std::size_t index,
                             std::size_t valueBytes) {
    const std::size_t bundle = layout.bundleOf(index);
    const std::size_t row = sliceLanes * itsGroup.slices * itsGroup.bundles;
    std::size_t position = 0;
    layout.forEachSegment(index, [&](std::size_t slice, std::size_t lane) {
        const std::size_t at = (slice * itsGroup.bundles + bundle) * sliceLanes + lane;
        for (std::size_t stream = 0; stream < 3; ++stream) {
            itsInputs[stream * row + at] =
                static_cast<const unsigned char*>(block.streams[stream]) + position * valueBytes;
        }
        itsOutputs[at] = block.bits + position;
        position += layout.steps;
    });
}

bool LaneDecoder::decodeGroup(const LaneLayout& layout, const Plan& plan, const LaneCall& call) {
    LaneGroup& group = itsGroup;
    group = {};
    group.segments = layout.segments;
    group.steps = layout.steps;
    group.slices = layout.slices();
    group.bundles = plan.bundles;
    group.windows = layout.windowLength.size();
    group.windowLength = layout.windowLength.data();
    group.iterations = call.iterations;
    group.shuffles = itsShuffles.data();
    group.natural = {layout.natural.row.data(), layout.natural.slices.data()};
    group.interleaved = {layout.interleaved.row.data(), layout.interleaved.slices.data()};
    for (std::uint32_t lane = 0; lane < sliceLanes; ++lane) {
        group.firstSegment[lane] = layout.segmentOf(0, lane) == 0 ? -1 : 0;
        group.lastSegment[lane] = layout.segmentOf(layout.slices() - 1, lane) + 1 == layout.segments ? -1 : 0;
    }
    const bool slicesInRow = plan.fill == Fill::slices;
    group.sliceWords = sliceLanes * (slicesInRow ? 1 : group.bundles * group.steps);
    group.rowWords =
        plan.fill == Fill::states ? 1 : sliceLanes * group.bundles * (slicesInRow ? group.slices : 1);
    group.valueBytes = call.valueBytes;
    group.iterationStride = call.iterationStride;
    // Until this group is done the store holds no block that could be read back.
    itsLast.K = 0;
    shareStore(layout, plan);
    const std::size_t row = sliceLanes * group.slices * group.bundles;
    itsInputs.assign(3 * row + sliceLanes, silence);  // with a slice ahead of the last one
    itsOutputs.assign(row, nullptr);
    for (std::size_t index = 0; index < call.blocks.size(); ++index) {
        placeBlock(layout, call.blocks[index], index, call.valueBytes);
    }
    group.inputs = itsInputs.data();
    group.outputs = itsOutputs.data();
    const auto& kernels = plan.fill == Fill::states   ? plan.kernel->alone
                          : plan.fill == Fill::slices ? plan.kernel->acrossSlices
                                                      : plan.kernel->acrossBundles;
    const bool saturated = kernels[itsAlgorithm](group);

    itsLast = {layout.K, call.iterations, call.blocks.size() - 1};
    return saturated;
}

void LaneDecoder::keepLast(LaneRows& rows) const {
    const std::int16_t* const first = itsGroup.systematic;
    const auto offsetOf = [first](const std::int16_t* part) {
        return static_cast<std::size_t>(part - first);
    };
    rows.K = itsLast.K;
    rows.iterations = itsLast.iterations;
    rows.index = itsLast.index;
    rows.sliceWords = itsGroup.sliceWords;
    rows.rowWords = itsGroup.rowWords;
    rows.streams[1] = offsetOf(itsGroup.parity[0]);
    rows.streams[2] = offsetOf(itsGroup.parity[1]);
    rows.tail = offsetOf(itsGroup.tail);
    // The streams and the tail stand one after the other in the store.
    const std::int16_t* const end = itsGroup.tail + lanes::tailSlices * sliceLanes * itsGroup.bundles;
    rows.words.assign(first, end);
}

std::vector<std::int16_t> LaneDecoder::softValues(const LaneRows& rows) const {
    const LaneLayout& layout = itsLayouts.at(rows.K);
    const std::size_t bundle = layout.bundleOf(rows.index);
    std::vector<std::int16_t> soft;
    soft.reserve(3 * std::size_t{layout.K} + lanes::tailSlices);
    std::size_t lastLane = 0;
    layout.forEachSegment(rows.index, [&](std::size_t slice, std::size_t lane) {
        for (std::size_t t = 0; t < layout.steps; ++t) {
            const std::size_t word = slice * rows.sliceWords + t * rows.rowWords + bundle * sliceLanes + lane;
            for (const std::size_t stream : rows.streams) {
                soft.push_back(rows.words[stream + word]);
            }
        }
        lastLane = lane;
    });
    for (std::size_t number = 0; number < lanes::tailSlices; ++number) {
        soft.push_back(rows.words[rows.tail + (bundle * lanes::tailSlices + number) * sliceLanes + lastLane]);
    }
    return soft;
}

}  // namespace quarzel

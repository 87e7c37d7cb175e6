// SPDX-License-Identifier: MIT
#include "decoder/lane_decode.hpp"

#include <algorithm>
#include <memory>

#include "decoder/segments.hpp"
#include "interleaver/interleaver.hpp"

namespace quarzel {

using lanes::LaneGroup;
using lanes::octetLanes;

namespace {

/// What a lane without a block decodes: as many zeros as a segment has steps and tail values, and more.
constexpr int silence[1024] = {};

/// Values of each stream after those of the steps.
constexpr std::uint32_t tailValues = 4;

constexpr std::size_t states = 8;

/// Most segments that a block of up to 6144 bits is cut into.
constexpr std::uint32_t mostSegments = 64;

}  // namespace

bool LaneDecoder::prepare(std::uint32_t K, const TInterleaver& interleaver) {
    if (itsLayouts.contains(K)) {
        return true;
    }
    const std::uint32_t segments = threadSegments(K, itsThreads);
    std::vector<std::uint32_t> permutation;
    if (segments > mostSegments || K % segments != 0 || K / segments + tailValues > std::size(silence) ||
        !interleaver.calcInterleaver(permutation, K)) {
        return false;
    }
    auto layout = makeLaneLayout(permutation, segments, itsShuffles);
    if (!layout) {
        return false;
    }
    itsLayouts.emplace(K, std::move(*layout));
    return true;
}

/// Fill the widest vectors: with the same octet of several bundles, else with the octets of one.
LaneDecoder::Plan LaneDecoder::plan(const LaneLayout& layout, std::size_t blocks) const {
    const std::size_t bundles = (blocks + layout.blocksPerBundle() - 1) / layout.blocksPerBundle();
    Plan best{&itsCandidate->kernels[0], false, 1};
    for (std::size_t i = 1; i < itsCandidate->kernelCount; ++i) {
        const lanes::LaneKernel& kernel = itsCandidate->kernels[i];
        const std::size_t slots = kernel.width / octetLanes;
        if (bundles >= slots) {
            best = {&kernel, false, static_cast<std::uint32_t>(slots)};
        } else if (layout.octets() % slots == 0) {
            best = {&kernel, true, 1};
        }
    }
    return best;
}

bool LaneDecoder::decode(std::uint32_t K, unsigned iterations, int algorithm,
                         std::span<const LaneBlock> blocks) {
    const LaneLayout& layout = itsLayouts.at(K);
    bool saturated = false;
    while (!blocks.empty()) {
        const Plan group = plan(layout, blocks.size());
        const std::size_t count =
            std::min<std::size_t>(blocks.size(), std::size_t{group.bundles} * layout.blocksPerBundle());
        saturated |= decodeGroup(layout, group, iterations, algorithm, blocks.first(count));
        blocks = blocks.subspan(count);
    }
    return saturated;
}

/// Give a group its parts of the store, each on a cache line of its own.
void LaneDecoder::shareStore(const LaneLayout& layout, std::size_t width) {
    constexpr std::size_t line = 64;
    constexpr std::size_t lineWords = line / sizeof(std::int16_t);
    const std::size_t row = octetLanes * layout.octets() * itsGroup.bundles;
    const std::size_t betaRows = layout.windowLength.size() * states;
    const struct {
        std::int16_t** part;
        std::size_t words;
    } parts[] = {
        {&itsGroup.systematic, layout.steps * row},
        {&itsGroup.parity[0], layout.steps * row},
        {&itsGroup.parity[1], layout.steps * row},
        {&itsGroup.tail, lanes::tailOctets * octetLanes * itsGroup.bundles},
        {&itsGroup.channel, layout.steps * row},
        {&itsGroup.extrinsic, layout.steps * row},
        {&itsGroup.alphaState, 2 * states * row},
        {&itsGroup.alphaStart[0], states * row},
        {&itsGroup.alphaStart[1], states * row},
        {&itsGroup.betaStart[0], betaRows * row},
        {&itsGroup.betaStart[1], betaRows * row},
        {&itsGroup.boundary, states * row},
        {&itsGroup.stepRows, lanes::maxWindow * lanes::mostStepVectors * width},
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
}

/// Point the lanes of a block to its values.
void LaneDecoder::placeBlock(const LaneLayout& layout, const LaneBlock& block, std::size_t index) {
    const std::size_t bundle = index / layout.blocksPerBundle();
    const std::size_t row = octetLanes * itsGroup.octets * itsGroup.bundles;
    std::size_t position = 0;
    layout.forEachSegment(index, [&](std::size_t octet, std::size_t lane) {
        const std::size_t at = (octet * itsGroup.bundles + bundle) * octetLanes + lane;
        for (std::size_t stream = 0; stream < 3; ++stream) {
            itsInputs[stream * row + at] = block.streams[stream] + position;
        }
        itsOutputs[at] = block.bits + position;
        position += layout.steps;
    });
}

bool LaneDecoder::decodeGroup(const LaneLayout& layout, const Plan& plan, unsigned iterations, int algorithm,
                              std::span<const LaneBlock> blocks) {
    LaneGroup& group = itsGroup;
    group = {};
    group.steps = layout.steps;
    group.octets = layout.octets();
    group.bundles = plan.bundles;
    group.windows = layout.windowLength.size();
    group.windowLength = layout.windowLength.data();
    group.iterations = iterations;
    group.shuffles = itsShuffles.data();
    group.natural = {layout.natural.row.data(), layout.natural.octets.data()};
    group.interleaved = {layout.interleaved.row.data(), layout.interleaved.octets.data()};
    for (std::uint32_t lane = 0; lane < octetLanes; ++lane) {
        group.firstSegment[lane] = layout.segmentOf(0, lane) == 0 ? -1 : 0;
        group.lastSegment[lane] = layout.segmentOf(layout.octets() - 1, lane) + 1 == layout.segments ? -1 : 0;
    }
    group.octetWords = octetLanes * (plan.acrossOctets ? 1 : group.bundles * group.steps);
    group.rowWords = octetLanes * group.bundles * (plan.acrossOctets ? group.octets : 1);
    // Until this group is done the store holds no block that could be read back.
    itsLast.K = 0;
    shareStore(layout, plan.kernel->width);
    const std::size_t row = octetLanes * group.octets * group.bundles;
    itsInputs.assign(3 * row + octetLanes, silence);  // with an octet ahead of the last one
    itsOutputs.assign(row, nullptr);
    for (std::size_t index = 0; index < blocks.size(); ++index) {
        placeBlock(layout, blocks[index], index);
    }
    group.inputs = itsInputs.data();
    group.outputs = itsOutputs.data();
    const auto& kernels = plan.acrossOctets ? plan.kernel->acrossOctets : plan.kernel->acrossBundles;
    const bool saturated = kernels[algorithm](group);

    itsLast.K = layout.K;
    itsLast.iterations = iterations;
    itsLast.index = blocks.size() - 1;
    return saturated;
}

void LaneDecoder::readLast(std::vector<std::int8_t>& soft) const {
    const LaneLayout& layout = itsLayouts.at(itsLast.K);
    const std::size_t bundle = itsLast.index / layout.blocksPerBundle();
    const auto append = [&soft](std::int16_t word) { soft.push_back(static_cast<std::int8_t>(word >> 4)); };
    soft.clear();
    soft.reserve(3 * std::size_t{layout.K} + lanes::tailOctets);
    std::size_t lastLane = 0;
    layout.forEachSegment(itsLast.index, [&](std::size_t octet, std::size_t lane) {
        for (std::size_t t = 0; t < layout.steps; ++t) {
            const std::size_t word =
                octet * itsGroup.octetWords + t * itsGroup.rowWords + bundle * octetLanes + lane;
            for (const std::int16_t* stream : {itsGroup.systematic, itsGroup.parity[0], itsGroup.parity[1]}) {
                append(stream[word]);
            }
        }
        lastLane = lane;
    });
    for (std::size_t number = 0; number < lanes::tailOctets; ++number) {
        append(itsGroup.tail[(bundle * lanes::tailOctets + number) * octetLanes + lastLane]);
    }
}

}  // namespace quarzel

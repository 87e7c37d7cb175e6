// SPDX-License-Identifier: MIT
#include "decoder/lane_decode.hpp"

#include <algorithm>
#include <memory>

#include "decoder/segments.hpp"
#include "decoder/tail_metrics.hpp"
#include "fixed/soft_value.hpp"
#include "interleaver/interleaver.hpp"

namespace quarzel {

using lanes::LaneGroup;
using lanes::octetLanes;

namespace {

/// What a lane without a block decodes: more zeros than a segment has steps.
constexpr int silence[1024] = {};

constexpr std::size_t states = 8;

/// Most segments that a block of up to 6144 bits is cut into.
constexpr std::uint32_t mostSegments = 64;

/// Calls `visit(octet, lane, segment)` for every lane of a block: the octet of its bundle, the lane there,
/// and the thread segment in it.
template <class Visit>
void forEachSegment(const LaneLayout& layout, std::size_t index, Visit visit) {
    for (std::uint32_t octet = 0; octet < layout.octets(); ++octet) {
        for (std::uint32_t lane = 0; lane < octetLanes; ++lane) {
            if (layout.blockOf(lane) == index % layout.blocksPerBundle()) {
                visit(octet, lane, layout.segmentOf(octet, lane));
            }
        }
    }
}

}  // namespace

bool LaneDecoder::prepare(std::uint32_t K, const TInterleaver& interleaver) {
    if (itsLayouts.contains(K)) {
        return true;
    }
    const std::uint32_t segments = threadSegments(K, itsThreads);
    std::vector<std::uint32_t> permutation;
    if (segments > mostSegments || K % segments != 0 || K / segments > std::size(silence) ||
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

void LaneDecoder::decode(std::uint32_t K, unsigned iterations, int algorithm,
                         std::span<const LaneBlock> blocks) {
    const LaneLayout& layout = itsLayouts.at(K);
    while (!blocks.empty()) {
        const Plan group = plan(layout, blocks.size());
        const std::size_t count =
            std::min<std::size_t>(blocks.size(), std::size_t{group.bundles} * layout.blocksPerBundle());
        decodeGroup(layout, group, iterations, algorithm, blocks.first(count));
        blocks = blocks.subspan(count);
    }
}

/// Give a group its parts of the store, each on a cache line of its own.
void LaneDecoder::shareStore(const LaneLayout& layout, const Plan& plan, LaneGroup& group) {
    constexpr std::size_t line = 64;
    constexpr std::size_t lineWords = line / sizeof(std::int16_t);
    const std::size_t row = octetLanes * layout.octets() * plan.bundles;
    const std::size_t width = plan.kernel->width;
    const std::size_t betaRows = layout.windowLength.size() * states;
    const struct {
        std::int16_t** part;
        std::size_t words;
    } parts[] = {
        {&group.systematic, layout.steps * row},
        {&group.parity[0], layout.steps * row},
        {&group.parity[1], layout.steps * row},
        {&group.channel, layout.steps * row},
        {&group.extrinsic, layout.steps * row},
        {&group.alphaState, 2 * states * row},
        {&group.alphaStart[0], states * row},
        {&group.alphaStart[1], states * row},
        {&group.betaStart[0], betaRows * row},
        {&group.betaStart[1], betaRows * row},
        {&group.boundary, states * row},
        {&group.stepRows, lanes::maxWindow * lanes::mostStepVectors * width},
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
    for (std::size_t code = 0; code < 2; ++code) {
        std::fill_n(group.alphaStart[code], states * row, std::int16_t{0});
        std::fill_n(group.betaStart[code], betaRows * row, std::int16_t{0});
    }
}

/// Point the lanes of a block to its values, and set the starts that are known: the first forward one, and
/// the last backward one, which the tails give.
void LaneDecoder::placeBlock(const LaneLayout& layout, const LaneBlock& block, std::size_t index,
                             LaneGroup& group) {
    const TNumberFormat input(8, 3);
    const TNumberFormat state(12, 3);
    const std::size_t bundle = index / layout.blocksPerBundle();
    const std::size_t row = octetLanes * group.octets * group.bundles;
    // The twelve tail values follow each other across the three streams.
    for (std::size_t number = 0; number < 12; ++number) {
        int saturated = 0;
        itsLast.tail[number] =
            toSoftValue(block.streams[number % 3][layout.K + number / 3], input, state, saturated);
    }
    forEachSegment(layout, index, [&](std::size_t octet, std::size_t lane, std::size_t segment) {
        const std::size_t at = (octet * group.bundles + bundle) * octetLanes + lane;
        for (std::size_t stream = 0; stream < 3; ++stream) {
            itsInputs[stream * row + at] = block.streams[stream] + segment * layout.steps;
        }
        itsOutputs[at] = block.bits + segment * layout.steps;
        for (std::size_t code = 0; code < 2; ++code) {
            if (segment == 0) {
                for (std::size_t s = 1; s < states; ++s) {
                    group.alphaStart[code][s * row + at] = static_cast<std::int16_t>(state.min / 2);
                }
            }
            if (segment + 1 == layout.segments) {
                TailValues tail{};
                for (std::size_t step = 0; step < 3; ++step) {
                    tail.systematic[step] = itsLast.tail[6 * code + 2 * step];
                    tail.parity0[step] = itsLast.tail[6 * code + 2 * step + 1];
                }
                const T8 metrics = tailMetrics(tail);
                const std::int16_t top = *std::max_element(metrics.element, metrics.element + states);
                std::int16_t* const last = group.betaStart[code] + (group.windows - 1) * states * row;
                for (std::size_t s = 0; s < states; ++s) {
                    last[s * row + at] = sub(metrics[s], top);
                }
            }
        }
    });
}

void LaneDecoder::decodeGroup(const LaneLayout& layout, const Plan& plan, unsigned iterations, int algorithm,
                              std::span<const LaneBlock> blocks) {
    LaneGroup group{};
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
    // Until this group is done the store holds no block that could be read back.
    itsLast.K = 0;
    shareStore(layout, plan, group);
    const std::size_t row = octetLanes * group.octets * group.bundles;
    itsInputs.assign(3 * row, silence);
    itsOutputs.assign(row, nullptr);
    for (std::size_t index = 0; index < blocks.size(); ++index) {
        placeBlock(layout, blocks[index], index, group);
    }
    group.inputs = itsInputs.data();
    group.outputs = itsOutputs.data();
    (plan.acrossOctets ? plan.kernel->acrossOctets : plan.kernel->acrossBundles)[algorithm](group);

    itsLast.K = layout.K;
    itsLast.iterations = iterations;
    itsLast.bundles = group.bundles;
    itsLast.index = blocks.size() - 1;
    itsRows[0] = group.systematic;
    itsRows[1] = group.parity[0];
    itsRows[2] = group.parity[1];
}

void LaneDecoder::readLast(std::vector<std::int8_t>& soft) const {
    const LaneLayout& layout = itsLayouts.at(itsLast.K);
    const std::size_t row = octetLanes * layout.octets() * itsLast.bundles;
    const auto value = [](std::int16_t word) { return static_cast<std::int8_t>(word >> 4); };
    soft.resize(3 * std::size_t{layout.K} + std::size(itsLast.tail));
    forEachSegment(layout, itsLast.index, [&](std::size_t octet, std::size_t lane, std::size_t segment) {
        const std::size_t bundle = itsLast.index / layout.blocksPerBundle();
        const std::size_t at = (octet * itsLast.bundles + bundle) * octetLanes + lane;
        for (std::size_t t = 0; t < layout.steps; ++t) {
            for (std::size_t stream = 0; stream < 3; ++stream) {
                soft[3 * (segment * layout.steps + t) + stream] = value(itsRows[stream][t * row + at]);
            }
        }
    });
    std::transform(std::begin(itsLast.tail), std::end(itsLast.tail), soft.end() - std::ssize(itsLast.tail),
                   value);
}

}  // namespace quarzel

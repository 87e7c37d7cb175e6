// SPDX-License-Identifier: MIT
// Compiled once for each instruction set, with QUARZEL_KERNELS its name and QUARZEL_KERNELS_LANES its lanes.
#include "bench/lane_kernels.hpp"

#include "lanes/lane_loops.hpp"

namespace quarzel::bench {

namespace {

using lanes::LaneGroup;
constexpr std::size_t width = QUARZEL_KERNELS_LANES;

/// Call `visit(window, column)` for every window and every vector of a row.
template <class Decoder, class Visit>
void forEachWindow(const LaneGroup& group, Visit visit) {
    std::size_t bottom = 0;
    for (std::size_t w = 0; w < group.windows; ++w) {
        const typename Decoder::Window window{bottom, group.windowLength[w], w == 0, w + 1 == group.windows};
        for (std::size_t column = 0; column < group.slices; ++column) {
            visit(window, column);
        }
        bottom += window.length;
    }
}

void readInputs(const LaneGroup& group) {
    lanes::readInputs(group);
    lanes::setStarts<true>(group);
}

void writeDecisions(const LaneGroup& group) {
    lanes::writeDecisions(group, 0);
}

template <int Algorithm>
void forward(const LaneGroup& group) {
    using Decoder = lanes::GroupDecoder<width, false, Algorithm>;
    const Decoder decoder(group);
    forEachWindow<Decoder>(group, [&](const auto& window, std::size_t column) {
        decoder.template forward<1>(window, column, false);
    });
}

/// The last window's starts serve all.
template <int Algorithm>
void backward(const LaneGroup& group) {
    using Decoder = lanes::GroupDecoder<width, false, Algorithm>;
    const Decoder decoder(group);
    forEachWindow<Decoder>(group, [&](const auto& window, std::size_t column) {
        decoder.template backward<1>(window, column, group.betaStart[1] + column * width,
                                     group.boundary + column * width, false);
    });
}

/// What a limit's loops do beside the recursions.
enum class With { nothing, stores, ratio, everything };

template <With with>
QUARZEL_LANES_LOOP void limit(std::size_t rows, std::int16_t* memory) {
    using Word = lanes::Lanes<width>;
    using Rules = lanes::LaneRules<width, 1>;
    const auto rule = Rules::recursion();
    lanes::Metrics<width> alpha{};
    lanes::Metrics<width> beta{};
    const auto assign = [](auto& to, const auto& from) {
        unrolled<lanes::states>([&](auto i) { to[i] = from[i]; });
    };
    const auto normalise = [](auto& metrics) {
        const Word offset = lanes::largest<width>(metrics) & Word::of(boundaryMask);
        unrolled<lanes::states>([&](auto i) { metrics[i] = sub(metrics[i], offset); });
    };
    // A row: channel and parity, or branch metrics; forward metrics; what comes out.
    const auto vectorOf = [memory](std::size_t row, std::size_t number) {
        return memory + (row * limitVectors + number) * width;
    };
    const auto metricsOf = [&](std::size_t row, bool interleaved) {
        Word first = Word::load(vectorOf(row, 0));
        const Word second = Word::load(vectorOf(row, 1));
        if constexpr (with != With::everything) {
            return BranchMetrics<Word>{first, second, second, first};
        }
        if (interleaved) {
            first = lanes::shuffleSlices(first, Word::load(vectorOf(0, 11)));
        }
        const lanes::SignedMetrics<Word> metrics(first, second);
        return BranchMetrics<Word>{metrics.same, metrics.opposite, metrics.opposite, metrics.same};
    };
    for (; rows > 0; rows -= limitRows) {
        for (std::size_t row = 0; row < limitRows; ++row) {
            if constexpr (with != With::nothing) {
                lanes::storeMetrics<width>(alpha, vectorOf(row, 2), width);
            }
            assign(alpha, alphaStep<typename Rules::Recursion>(alpha, metricsOf(row, true), rule));
            if (row % lanes::normalisedRows == 0) {
                normalise(alpha);
            }
        }
        for (std::size_t row = limitRows; row-- > 0;) {
            const auto metrics = metricsOf(row, false);
            if constexpr (with == With::nothing || with == With::stores) {
                assign(beta, betaStep<typename Rules::Recursion>(beta, metrics, rule));
            } else {
                const auto stored = [&](std::size_t i) { return Word::load(vectorOf(row, 2 + i)); };
                const auto result = backwardStep(beta, metrics, stored, rule, Rules::llr());
                assign(beta, result.beta);
                Word out = result.llr;
                if constexpr (with == With::everything) {
                    const Word channel = Word::load(vectorOf(row, 0));
                    out = add(channel, lanes::halfExtrinsic<Rules>(result.llr, channel));
                }
                out.store(vectorOf(row, 10));
            }
            if (row % lanes::normalisedRows == 0) {
                normalise(beta);
            }
        }
    }
    // Results are written, so that they are not optimised away.
    lanes::storeMetrics<width>(alpha, memory + 2 * width, width);
    lanes::storeMetrics<width>(beta, vectorOf(1, 2), width);
}

}  // namespace

extern const LaneKernels QUARZEL_KERNELS;
const LaneKernels QUARZEL_KERNELS = {width,
                                     readInputs,
                                     {forward<0>, forward<1>, forward<2>},
                                     {backward<0>, backward<1>, backward<2>},
                                     writeDecisions,
                                     {{"recursions", limit<With::nothing>},
                                      {"stores", limit<With::stores>},
                                      {"ratio", limit<With::ratio>},
                                      {"everything", limit<With::everything>}}};

}  // namespace quarzel::bench

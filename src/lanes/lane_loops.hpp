// SPDX-License-Identifier: MIT
#pragma once

// How a group is decoded: the one text of all instruction sets and widths. A file of an instruction set
// includes it and names the widths.

#include <cassert>
#include <utility>

#include "engine/steps.hpp"
#include "lanes/lane_alone.hpp"
#include "lanes/lane_boundaries.hpp"
#include "lanes/lane_inputs.hpp"
#include "lanes/lane_rules.hpp"

namespace quarzel::lanes {
namespace {

/// Rows after which the metrics are normalised, and rows after a backward start in which a path of the ratio
/// may leave 16 bits: a tail's metrics lie that far apart.
constexpr std::size_t normalisedRows = 8;
constexpr std::size_t unboundedRows = 1;

/// Decodes one group at one width. `AcrossSlices` tells whether a vector holds slices of one bundle rather
/// than one slice of several bundles.
template <std::size_t W, bool AcrossSlices, int Algorithm>
class GroupDecoder {
    using Word = Lanes<W>;
    using Rules = LaneRules<W, Algorithm>;
    using Recursion = typename Rules::Recursion;
    using State = StateMetrics<Recursion>;
    static constexpr std::size_t slots = W / sliceLanes;

    /// Lanes of a row of boundaries that belong to the same slice of all bundles.
    static constexpr std::size_t neighbours = AcrossSlices ? sliceLanes : W;

    /// Whether the forward half of a window keeps the branch metrics for the backward half. At 32 lanes they
    /// would drive the forward metrics out of the first-level cache.
    static constexpr bool keepsBranchMetrics = W < 32;

    /// Vectors that a step keeps: the forward metrics before it, twice the intrinsic value, branch metrics.
    static constexpr std::size_t stepVectors = states + 1 + (keepsBranchMetrics ? 2 : 0);
    static_assert(stepVectors <= maxStepVectors);

  public:
    explicit GroupDecoder(const LaneGroup& group)
        : itsGroup(group), itsRow(sliceLanes * group.slices * group.bundles) {}

    /// @return whether a soft value was saturated
    bool decode() {
        const bool saturated = readInputs(itsGroup);
        setStarts<Rules::normalised>(itsGroup);
        for (unsigned iteration = 0; iteration < itsGroup.iterations; ++iteration) {
            const bool last = iteration + 1 == itsGroup.iterations;
            pass<1>(iteration == 0, false);
            pass<0>(iteration == 0, last);
            if (last || decidesAlways()) {
                writeDecisions(itsGroup, static_cast<std::ptrdiff_t>(iteration) * itsGroup.iterationStride);
            }
        }
        return saturated;
    }

    /// The window that a recursion is at.
    struct Window {
        std::size_t bottom;
        std::size_t length;
        bool first;
        bool last;
    };

    /// Forward over a window: keep the metrics before each step, and the state after the last.
    template <int Code>
    QUARZEL_LANES_LOOP void forward(const Window& window, std::size_t column, bool firstIteration) const {
        // A copy that no store can reach, so that its members stay in registers.
        const GroupDecoder here(*this);
        const Recursion rule = Rules::recursion();
        const std::size_t at = column * W;
        State state = window.first ? load(loadMetrics<W>(here.itsGroup.alphaStart[Code] + at, here.itsRow))
                                   : here.loadAlphaState(here.itsGroup.alphaState + at);
        const auto step = [&](std::size_t t) {
            const Word channel = here.channelValue<Code>(window.bottom + t, column, firstIteration);
            const SignedMetrics<Word> distinct(channel, here.parity<Code>(window.bottom + t, column));
            std::int16_t* const stored = here.itsGroup.stepRows + t * stepVectors * W;
            storeMetrics<W>(words(state), stored, W);
            channel.store(stored + states * W);
            if constexpr (keepsBranchMetrics) {
                distinct.same.store(stored + (states + 1) * W);
                distinct.opposite.store(stored + (states + 2) * W);
            }
            assign(state, alphaStep<Recursion>(state, symmetric(distinct.same, distinct.opposite), rule));
        };
        std::size_t t = 0;
        while (t + normalisedRows <= window.length) {
            for (std::size_t i = 0; i < normalisedRows; ++i) {
                step(t++);
            }
            normalise(state);
        }
        while (t < window.length) {
            step(t++);
        }
        normalise(state);
        if (window.last) {
            here.storeBoundary(state, here.itsGroup.alphaState + at);
        } else {
            here.storeAlphaState(state, here.itsGroup.alphaState + at);
        }
    }

    /// Backward over a window, with the LLR and the extrinsic value of each step.
    /// @param start  the boundary above its highest step
    /// @param end    receives the one below its lowest step
    template <int Code>
    QUARZEL_LANES_LOOP void backward(const Window& window, std::size_t column, const std::int16_t* start,
                                     std::int16_t* end, bool lastPass) const {
        const GroupDecoder here(*this);
        const Recursion rule = Rules::recursion();
        State state = load(loadMetrics<W>(start, here.itsRow));
        const auto step = [&](std::size_t t, const auto& llrRule) {
            const std::size_t row = window.bottom + t;
            const std::int16_t* const stored = here.itsGroup.stepRows + t * stepVectors * W;
            const Word channel = Word::load(stored + states * W);
            BranchMetrics<Word> metrics;
            if constexpr (keepsBranchMetrics) {
                metrics =
                    symmetric(Word::load(stored + (states + 1) * W), Word::load(stored + (states + 2) * W));
            } else {
                const SignedMetrics<Word> distinct(channel, here.parity<Code>(row, column));
                metrics = symmetric(distinct.same, distinct.opposite);
            }
            const auto alpha = [stored](std::size_t i) { return Word::load(stored + i * W); };
            const auto result = backwardStep(state, metrics, alpha, rule, llrRule);
            assert(same(result.llr, backwardStep(state, metrics, alpha, rule, Rules::llrNearStart()).llr));
            assign(state, result.beta);
            here.output<Code>(row, column, result.llr, channel, lastPass);
        };
        std::size_t t = window.length;
        for (std::size_t i = 0; i < normalisedRows; ++i) {
            --t;
            if (i < unboundedRows) {
                step(t, Rules::llrNearStart());
            } else {
                step(t, Rules::llr());
            }
        }
        normalise(state);
        while (t >= normalisedRows) {
            for (std::size_t i = 0; i < normalisedRows; ++i) {
                step(--t, Rules::llr());
            }
            normalise(state);
        }
        while (t > 0) {
            step(--t, Rules::llr());
        }
        here.storeBoundary(state, end);
    }

  private:
    const LaneGroup itsGroup;
    const std::size_t itsRow;  ///< words in a row

    /// Whether there are decisions after every iteration.
    bool decidesAlways() const { return itsGroup.iterationStride != 0; }

    /// The first word of a vector in the step rows.
    std::size_t stepWord(std::size_t row, std::size_t column) const {
        return AcrossSlices ? row * itsGroup.rowWords + column * W : column * itsGroup.sliceWords + row * W;
    }

    /// One pass of a constituent code over all windows, from the lowest up.
    template <int Code>
    void pass(bool firstIteration, bool lastPass) {
        const std::size_t boundaryWords = states * itsRow;
        std::int16_t* const starts = itsGroup.betaStart[Code];
        std::int16_t* const lastStarts = starts + (itsGroup.windows - 1) * boundaryWords;
        // What the first windows end with starts the last ones of the segments below: in this pass when other
        // windows run in between, else in the next one. In the first iteration no start is known.
        const bool handsOn = itsGroup.segments > 1;
        const bool handDownAtOnce = handsOn && itsGroup.windows >= 3 && !firstIteration;
        std::size_t bottom = 0;
        for (std::size_t w = 0; w < itsGroup.windows; ++w) {
            const Window window{bottom, itsGroup.windowLength[w], w == 0, w + 1 == itsGroup.windows};
            std::int16_t* const ends = w == 0 ? itsGroup.boundary : starts + (w - 1) * boundaryWords;
            for (std::size_t column = 0; column * W < itsRow; ++column) {
                const std::size_t at = column * W;
                forward<Code>(window, column, firstIteration);
                backward<Code>(window, column, starts + w * boundaryWords + at, ends + at, lastPass);
            }
            if (w == 0 && handDownAtOnce) {
                handDown<neighbours>(itsGroup, lastStarts);
            }
            bottom += window.length;
        }
        if (handsOn && !handDownAtOnce) {
            handDown<neighbours>(itsGroup, lastStarts);
        }
        if (handsOn) {
            handUp<neighbours>(itsGroup, itsGroup.alphaStart[Code]);
        }
    }

    template <int Code>
    void output(std::size_t row, std::size_t column, Word llr, Word channel, bool lastPass) const {
        const std::size_t at = stepWord(row, column);
        if constexpr (Code == 1) {
            halfExtrinsic<Rules>(llr, channel).store(itsGroup.extrinsic + at);
        } else {
            if (lastPass || decidesAlways()) {
                llr.store(itsGroup.llr + at);
            }
            if (!lastPass) {
                add(Word::load(itsGroup.systematic + at), halfExtrinsic<Rules>(llr, channel))
                    .store(itsGroup.channel + at);
            }
        }
    }

    template <int Code>
    Word parity(std::size_t row, std::size_t column) const {
        return Word::load(itsGroup.parity[Code] + stepWord(row, column));
    }

    /// The channel value plus half the extrinsic value of the other code, in the order of this one: twice the
    /// intrinsic value.
    template <int Code>
    Word channelValue(std::size_t row, std::size_t column, bool firstIteration) const {
        const RowSources& sources = Code == 0 ? itsGroup.natural : itsGroup.interleaved;
        const std::int16_t* given = Code == 0        ? itsGroup.extrinsic
                                    : firstIteration ? itsGroup.systematic
                                                     : itsGroup.channel;
        const Word value =
            permuted(given + stepWord(sources.row[row], 0), sources.slices + row * itsGroup.slices, column,
                     std::make_index_sequence<slots>());
        if constexpr (Code == 0) {
            return add(value, Word::load(itsGroup.systematic + stepWord(row, column)));
        } else {
            return value;
        }
    }

    /// A vector of the source row's lanes, where this row wants them.
    /// @param from  the source row's first slice
    template <std::size_t... Slot>
    Word permuted(const std::int16_t* from, const SliceSource* sources, std::size_t column,
                  std::index_sequence<Slot...>) const {
        if constexpr (AcrossSlices) {
            sources += column * slots;
            return shuffleSlices(joinSlices(Lanes<8>::load(from + sources[Slot].slice * sliceLanes)...),
                                 joinSlices(loadShuffle(itsGroup.shuffles[sources[Slot].shuffle])...));
        } else {
            const SliceSource source = sources[column];
            return shuffleSlices(Word::load(from + source.slice * itsGroup.sliceWords),
                                 repeated<W>(loadShuffle(itsGroup.shuffles[source.shuffle])));
        }
    }

    /// The four branch metrics.
    static BranchMetrics<Word> symmetric(Word same, Word opposite) {
        return {same, opposite, opposite, same};
    }

    /// Keep metrics from wrapping. The steps are multiples of what a boundary clears, so that neither
    /// disturbs the other.
    static void normalise(State& state) {
        if constexpr (Rules::normalised) {
            const Word offset = largest<W>(state) & Word::of(boundaryMask);
            unrolled<states>([&](auto i) { state[i] = sub(state[i], offset); });
        }
    }

    /// Metric by metric: GCC copies a whole array through memory.
    static void assign(State& to, const State& from) {
        unrolled<states>([&](auto i) { to[i] = from[i]; });
    }

    static Metrics<W> words(const State& state) {
        Metrics<W> m;
        unrolled<states>([&](auto i) { m[i] = Recursion::store(state[i]); });
        return m;
    }

    static State load(const Metrics<W>& m) {
        State state;
        unrolled<states>([&](auto i) { state[i] = Recursion::load(m[i]); });
        return state;
    }

    void storeBoundary(const State& state, std::int16_t* to) const {
        storeMetrics<W>(toBoundary<Rules::normalised, W>(words(state)), to, itsRow);
    }

    State loadAlphaState(const std::int16_t* from) const {
        State state = load(loadMetrics<W>(from, itsRow));
        if constexpr (!Rules::normalised) {
            unrolled<states>([&](auto i) { state[i].pending = Word::load(from + (states + i) * itsRow); });
        }
        return state;
    }

    void storeAlphaState(const State& state, std::int16_t* to) const {
        storeMetrics<W>(words(state), to, itsRow);
        if constexpr (!Rules::normalised) {
            unrolled<states>([&](auto i) { state[i].pending.store(to + (states + i) * itsRow); });
        }
    }
};

template <std::size_t W, bool AcrossSlices, int Algorithm>
bool decodeGroup(const LaneGroup& group) {
    return GroupDecoder<W, AcrossSlices, Algorithm>(group).decode();
}

/// The kernel of one width.
template <std::size_t W>
constexpr LaneKernel kernelOf() {
    LaneKernel kernel{
        W, {decodeGroup<W, false, 0>, decodeGroup<W, false, 1>, decodeGroup<W, false, 2>}, {}, {}};
    if constexpr (W > sliceLanes) {
        kernel.acrossSlices[0] = decodeGroup<W, true, 0>;
        kernel.acrossSlices[1] = decodeGroup<W, true, 1>;
        kernel.acrossSlices[2] = decodeGroup<W, true, 2>;
    }
#if defined(QUARZEL_LANES_SHUFFLE)
    if constexpr (W == sliceLanes) {
        kernel.alone[0] = decodeAlone<0>;
        kernel.alone[1] = decodeAlone<1>;
    }
#endif
    return kernel;
}

}  // namespace
}  // namespace quarzel::lanes

// SPDX-License-Identifier: MIT
#pragma once

#include <cassert>

#include "lanes/lane_boundaries.hpp"
#include "lanes/lane_rules.hpp"
#include "lanes/lane_soft_input.hpp"
#include "lanes/lane_states.hpp"

// One block of one segment. It has no other segments to fill lanes with, so its eight states do: a word is
// one step of all states, not one state of many steps, and a step is two shuffles and three operations. That
// is why it does not share the text of a step, only the table of the trellis and the rules of the maximum.
namespace quarzel::lanes {
namespace {

/// Decodes one block of one segment. Rows of its group are single words.
template <int Algorithm>
class BlockDecoder {
    using Word = Lanes<8>;
    using Rules = LaneRules<8, Algorithm>;

    /// What the forward half of a window leaves for its backward half, for eight steps.
    struct Steps {
        Squares<8> alpha;  ///< metrics before each step
        Word metrics[2];   ///< branch metrics of four steps: same and opposite signs in turns
        Word channel;      ///< twice the intrinsic values
    };

    static constexpr std::size_t stepsAtOnce = 8;

  public:
    explicit BlockDecoder(const LaneGroup& group) : itsGroup(group) {}

    /// @return whether a soft value was saturated
    template <class Value>
    bool decode() {
        const bool saturated = readBlock<Value>();
        for (std::size_t code = 0; code < 2; ++code) {
            setStarts(code);
        }
        for (unsigned iteration = 0; iteration < itsGroup.iterations; ++iteration) {
            const bool last = iteration + 1 == itsGroup.iterations;
            const auto offset = static_cast<std::ptrdiff_t>(iteration) * itsGroup.iterationStride;
            pass<1>(iteration == 0, nullptr);
            pass<0>(false, last || itsGroup.iterationStride != 0 ? itsGroup.outputs[0] + offset : nullptr);
        }
        return saturated;
    }

  private:
    template <class Value>
    bool readBlock() {
        SoftInput input;
        std::int16_t* const rows[3] = {itsGroup.systematic, itsGroup.parity[0], itsGroup.parity[1]};
        for (std::size_t stream = 0; stream < 3; ++stream) {
            const auto* const values = static_cast<const Value*>(itsGroup.inputs[stream * sliceLanes]);
            for (std::size_t t = 0; t < itsGroup.steps; t += stepsAtOnce) {
                input.toWords<8>(values + t).store(rows[stream] + t);
            }
            const Word tail = input.toWords<8>(values + itsGroup.steps - 4);
            for (std::size_t position = 0; position < 4; ++position) {
                itsGroup.tail[(3 * position + stream) * sliceLanes] = tail.v[4 + position];
            }
        }
        return input.saturated();
    }

    /// The starts of the first pass: of the last window known by the tail, of the others unknown.
    void setStarts(std::size_t code) const {
        const Metrics<8> known = toBoundary<true, 8>(tailMetricsOf(itsGroup, 0, code));
        std::int16_t* const last = itsGroup.betaStart[code] + (itsGroup.windows - 1) * states;
        std::memset(itsGroup.betaStart[code], 0, itsGroup.windows * states * sizeof *last);
        for (std::size_t lane = 0; lane < states; ++lane) {
            last[lane] = known[stateInLane[lane]].v[0];
        }
    }

    /// One pass of a constituent code over all windows, from the lowest up.
    /// @param bits  receives decisions, unless it is null
    template <int Code>
    QUARZEL_LANES_LOOP void pass(bool firstIteration, unsigned char* bits) const {
        Word alpha = Word::of(otherState);
        alpha.v[laneOfState(0)] = 0;
        std::int16_t* const starts = itsGroup.betaStart[Code];
        std::size_t bottom = 0;
        for (std::size_t w = 0; w < itsGroup.windows; ++w) {
            const std::size_t length = itsGroup.windowLength[w];
            Steps stored[maxWindow / stepsAtOnce];
            std::size_t t = 0;
            for (; t + stepsAtOnce <= length; t += stepsAtOnce) {
                forward<Code, 8>(stored[t / stepsAtOnce], bottom + t, alpha, firstIteration);
            }
            Word beta = Word::load(starts + w * states);
            if (t < length) {
                forward<Code, 4>(stored[t / stepsAtOnce], bottom + t, alpha, firstIteration);
                backward<Code, 4>(stored[t / stepsAtOnce], bottom + t, beta, bits, MaxLog<Word>());
            }
            while (t > 0) {
                // Where a path may leave 16 bits.
                const bool nearStart = t == length;
                t -= stepsAtOnce;
                if (nearStart) {
                    backward<Code, 8>(stored[t / stepsAtOnce], bottom + t, beta, bits, MaxLog<Word>());
                } else {
                    backward<Code, 8>(stored[t / stepsAtOnce], bottom + t, beta, bits, PlainMaxLog<Word>());
                }
            }
            if (w > 0) {
                const Word boundary = beta & Word::of(boundaryMask);
                sub(boundary, largestOf(boundary)).store(starts + (w - 1) * states);
            }
            bottom += length;
        }
    }

    /// Forward over Count steps, 4 or 8: keep the metrics before each of them.
    template <int Code, std::size_t Count>
    void forward(Steps& stored, std::size_t t, Word& alpha, bool firstIteration) const {
        stored.channel = channelValues<Code, Count>(t, firstIteration);
        const SignedMetrics<Word> distinct(stored.channel, Word::load(itsGroup.parity[Code] + t));
        stored.metrics[0] = interleaveLow(distinct.same, distinct.opposite);
        stored.metrics[1] = interleaveHigh(distinct.same, distinct.opposite);
        unrolled<Count>([&](auto i) {
            const Word metric = shuffled(stored.metrics[i / 4], trellisShuffles.arriving[i % 4]);
            stored.alpha[i] = alpha;
            alpha = max(add(shuffled(alpha, trellisShuffles.plusSource), metric),
                        sub(shuffled(alpha, trellisShuffles.minusSource), metric));
        });
        normalise(alpha);
    }

    /// Backward over Count steps, with the LLR and the extrinsic value of each.
    template <int Code, std::size_t Count, class LlrRule>
    void backward(const Steps& stored, std::size_t t, Word& beta, unsigned char* bits,
                  const LlrRule& llrRule) const {
        Squares<8> plus{};
        Squares<8> minus{};
        unrolled<Count>([&](auto number) {
            constexpr std::size_t i = Count - 1 - number;
            const Word metric = shuffled(stored.metrics[i / 4], trellisShuffles.leaving[i % 4]);
            const Word plusEnd = add(shuffled(beta, trellisShuffles.plusTarget), metric);
            const Word minusEnd = sub(shuffled(beta, trellisShuffles.minusTarget), metric);
            plus[i] = add(stored.alpha[i], plusEnd);
            minus[i] = add(stored.alpha[i], minusEnd);
            beta = max(plusEnd, minusEnd);
        });
        normalise(beta);
        const auto ratio = [&](const auto& rule) {
            return sub(bestOfEight(plus, rule), bestOfEight(minus, rule));
        };
        const Word llr = ratio(llrRule);
        assert(same(llr, ratio(MaxLog<Word>())));
        // Of four steps, more is stored than there is: the next window covers it, or nobody reads it.
        const Word extrinsic = halfExtrinsic<Rules>(llr, stored.channel);
        if constexpr (Code == 1) {
            extrinsic.store(itsGroup.extrinsic + t);
        } else {
            add(Word::load(itsGroup.systematic + t), extrinsic).store(itsGroup.channel + t);
            if (bits != nullptr) {
                storeBits<Count>(llr, bits + t);
            }
        }
    }

    /// Twice the intrinsic values: the channel value plus half the extrinsic one of the other code.
    template <int Code, std::size_t Count>
    Word channelValues(std::size_t t, bool firstIteration) const {
        const std::uint16_t* const source = (Code == 0 ? itsGroup.natural.row : itsGroup.interleaved.row) + t;
        const std::int16_t* const given = Code == 0        ? itsGroup.extrinsic
                                          : firstIteration ? itsGroup.systematic
                                                           : itsGroup.channel;
        Word value{};
        unrolled<Count>([&](auto i) { value.v[i()] = given[source[i]]; });
        return Code == 0 ? add(value, Word::load(itsGroup.systematic + t)) : value;
    }

    static void normalise(Word& metrics) {
        metrics = sub(metrics, largestOf(metrics) & Word::of(boundaryMask));
    }

    const LaneGroup& itsGroup;
};

template <int Algorithm>
bool decodeAlone(const LaneGroup& group) {
    BlockDecoder<Algorithm> decoder(group);
    return withValues(group, [&](auto value) { return decoder.template decode<decltype(value)>(); });
}

}  // namespace
}  // namespace quarzel::lanes

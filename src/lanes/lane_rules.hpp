// SPDX-License-Identifier: MIT
#pragma once

#include "engine/max_rules.hpp"
#include "lanes/lane_word.hpp"

namespace quarzel::lanes {
namespace {

/// Soft values as channel and extrinsic halves are bounded by the branch format, left-aligned in the state's.
constexpr std::int16_t lowest = -2048;
constexpr std::int16_t highest = 2032;

/// Max-log with the plain maximum, for metrics that are kept from wrapping.
template <class WordType>
struct PlainMaxLog : MaxLog<WordType> {
    using Word = WordType;
    using Metric = Word;
    Metric larger(Metric x, Metric y) const { return max(x, y); }
};

/// The 16-point correction table of the state format Fix_12_3 as a staircase: steps of 64 in the magnitude of
/// the difference, which is its complement where it is negative.
template <class Word>
struct Staircase;

template <std::size_t W>
struct Staircase<Lanes<W>> {
    Lanes<W> operator()(Lanes<W> difference) const {
        const Lanes<W> magnitude = max(difference, Lanes<W>{~difference.v});
#if defined(QUARZEL_LANES_SHUFFLE)
        // Counted downward from the first step without a correction, so that the high byte of a word, which
        // is 0, looks up a 0 too.
        return shuffleSlices(table(), subSaturated(Lanes<W>::of(6 * 64 + 63), magnitude) >> 6);
    }

  private:
    static Lanes<W> table() {
        typename VectorOf<2 * W>::Bytes bytes{};
        for (std::size_t slice = 0; slice < 2 * W; slice += 16) {
            bytes[slice + 1] = 16;
            bytes[slice + 2] = 16;
            bytes[slice + 3] = 32;
            bytes[slice + 4] = 48;
            bytes[slice + 5] = 64;
            bytes[slice + 6] = 96;
        }
        return {(typename Lanes<W>::Signed)bytes};
    }
#else
        const auto below = [&](std::int16_t end, std::int16_t height) {
            return Lanes<W>{(magnitude.v < end) & height};
        };
        return add(add(add(below(64, 32), below(128, 16)), add(below(192, 16), below(256, 16))),
                   below(384, 16));
    }
#endif
};

/// What differs between the algorithm types.
template <std::size_t W, int Algorithm>
struct LaneRules {
    using Word = Lanes<W>;
    using Recursion = PlainMaxLog<Word>;
    static constexpr bool normalised = true;  ///< metrics are kept from wrapping
    static constexpr bool scaled = Algorithm == 1;
    static Recursion recursion() { return {}; }
    /// Where the paths of a ratio stay inside 16 bits ...
    static PlainMaxLog<Word> llr() { return {}; }
    /// ... and where they may leave them.
    static MaxLog<Word> llrNearStart() { return {}; }
};

template <std::size_t W>
struct LaneRules<W, 2> {
    using Word = Lanes<W>;
    using Recursion = DeferredMaxStar<Word, Staircase<Word>>;
    static constexpr bool normalised = false;
    static constexpr bool scaled = false;
    static Recursion recursion() { return Recursion({}); }
    static Recursion llr() { return Recursion({}); }
    static Recursion llrNearStart() { return Recursion({}); }
};

/// The branch metrics where both parities have the sign of the intrinsic value's or the opposite one. Without
/// a second parity a code has only these two.
/// @param channel  twice the intrinsic value
template <class Word>
struct SignedMetrics {
    Word same;
    Word opposite;

    SignedMetrics(Word channel, Word parity)
        : same(clamp(add(channel, parity))), opposite(clamp(sub(channel, parity))) {}

  private:
    static Word clamp(Word sum) { return max(min(sum, Word::of(highest)), Word::of(lowest)); }
};

/// Half the extrinsic value, kept to the state format's precision: the LLR less four times the intrinsic
/// value, scaled, clamped and halved. Every value is a multiple of 16, so that the truncating divisions of
/// the definition are exact and their order does not matter.
///
/// @param channel  twice the intrinsic value
template <class Rules>
inline typename Rules::Word halfExtrinsic(typename Rules::Word llr, typename Rules::Word channel) {
    using Word = typename Rules::Word;
    const Word half = sub(llr >> 1, channel);
    const Word scaled = Rules::scaled ? sub(half, half >> 2) : half;
    return max(min(scaled & Word::of(-16), Word::of((highest / 2) & -16)), Word::of(lowest / 2));
}

}  // namespace
}  // namespace quarzel::lanes

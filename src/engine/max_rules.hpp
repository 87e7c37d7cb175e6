// SPDX-License-Identifier: MIT
#pragma once

#include "fixed/wrap16.hpp"

/// The three rules by which the trellis steps choose between two candidates.
///
/// A rule works on its own `Metric`, made from a stored word by `load`. `plus` and `minus` add a branch
/// metric, `larger` chooses (the first candidate at a tie), `store` is the word that goes to memory, and
/// `result` the value of a maximum that no later level follows. `Correction` gives the correction ln(1 +
/// e^-|d|) of a wrapped difference d, in the metrics' own alignment.
namespace quarzel {

/// Max-log: the modulo maximum, nothing added.
template <class WordType>
struct MaxLog {
    using Word = WordType;
    using Metric = Word;

    static constexpr Metric load(Word word) { return word; }
    static constexpr Word store(Metric metric) { return metric; }
    static constexpr Word result(Metric metric) { return metric; }
    static constexpr Metric plus(Metric metric, Word g) { return add(metric, g); }
    static constexpr Metric minus(Metric metric, Word g) { return sub(metric, g); }
    constexpr Metric larger(Metric x, Metric y) const { return moduloMax(x, y); }
};

/// Max-star: the modulo maximum with its correction added at once.
template <class WordType, class Correction>
struct MaxStar : MaxLog<WordType> {
    using Word = WordType;
    using Metric = Word;

    Correction correction;

    explicit constexpr MaxStar(Correction c) : correction(c) {}

    constexpr Metric larger(Metric x, Metric y) const {
        const Word difference = sub(x, y);
        return add(chooseBySign(difference, x, y), correction(difference));
    }
};

/// Max-star as a pipelined datapath does it: a maximum selects on the values as they stand, and its
/// correction is added one level later, to the value that the next maximum selects.
template <class WordType, class Correction>
struct DeferredMaxStar {
    using Word = WordType;
    struct Metric {
        Word value;
        Word pending;  ///< the correction that the next level will add
    };

    Correction correction;

    explicit constexpr DeferredMaxStar(Correction c) : correction(c) {}

    static constexpr Metric load(Word word) { return {word, Word{}}; }
    static constexpr Word store(Metric metric) { return metric.value; }
    static constexpr Word result(Metric metric) { return add(metric.value, metric.pending); }
    static constexpr Metric plus(Metric metric, Word g) { return {add(metric.value, g), metric.pending}; }
    static constexpr Metric minus(Metric metric, Word g) { return {sub(metric.value, g), metric.pending}; }
    constexpr Metric larger(Metric x, Metric y) const {
        const Word difference = sub(x.value, y.value);
        return {chooseBySign(difference, result(x), result(y)), correction(difference)};
    }
};

}  // namespace quarzel

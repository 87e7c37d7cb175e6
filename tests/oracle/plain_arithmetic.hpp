// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>

namespace quarzel::oracle {

/// How a value loses its low bits.
enum class Rounding { down, towardZero, nearest };

/// The value divided by 2^bits.
inline int shiftRight(int value, int bits, Rounding rounding) {
    const int unit = 1 << bits;
    switch (rounding) {
        case Rounding::towardZero:
            return value / unit;
        case Rounding::nearest:
            return (value + unit / 2) >> bits;
        case Rounding::down:
            break;
    }
    return value >> bits;
}

/// A two's complement register: values beyond it wrap around, or saturate.
struct Register {
    int bits = 12;
    bool saturates = false;
};

inline int held(const Register& in, int value) {
    const int half = 1 << (in.bits - 1);
    return in.saturates ? std::clamp(value, -half, half - 1) : ((value + half) & (2 * half - 1)) - half;
}

/// How two candidates are compared.
struct Comparison {
    Register difference;        ///< the sign of the first less the second, held here, decides
    bool modulo = true;         ///< false: by their values as numbers
    bool secondAtTie = false;   ///< which one equal candidates give
    bool takesSmaller = false;  ///< the minimum
};

/// When the correction ln(1 + exp(-|difference|)) of a maximum is added.
enum class Timing { never, late, atOnce };

struct Correction {
    Timing timing = Timing::never;  ///< late: by the next maximum that takes the value
    std::array<int, 16> table{};    ///< by the difference without its low bits; 0 beyond
    int ignoredBits = 2;            ///< low bits of the difference
    bool complements = true;        ///< a negative difference stands at its complement, else at its negative
    bool swapsPending = false;      ///< the correction of the candidate that was not taken is added
};

/// A value with the correction that is still to be added.
struct Candidate {
    int value = 0;
    int pending = 0;
};

inline int correctionOf(const Correction& correction, int difference) {
    const int magnitude =
        difference >= 0 ? difference : (correction.complements ? -difference - 1 : -difference);
    const auto place = static_cast<std::size_t>(magnitude >> correction.ignoredBits);
    return place < correction.table.size() ? correction.table[place] : 0;
}

/// The maximum of two candidates.
inline Candidate maximum(const Comparison& by, const Correction& correction, const Register& in,
                         const Candidate& first, const Candidate& second) {
    const int difference =
        by.modulo ? held(by.difference, first.value - second.value) : first.value - second.value;
    bool takesSecond = difference < 0 || (by.secondAtTie && difference == 0);
    takesSecond = takesSecond != by.takesSmaller;
    const Candidate& taken = takesSecond ? second : first;
    const int pending = takesSecond != correction.swapsPending ? second.pending : first.pending;
    if (correction.timing == Timing::never) {
        return {held(in, taken.value + pending), 0};
    }
    const int own = correctionOf(correction, difference);
    return correction.timing == Timing::late ? Candidate{held(in, taken.value + pending), own}
                                             : Candidate{held(in, taken.value + pending + own), 0};
}

}  // namespace quarzel::oracle

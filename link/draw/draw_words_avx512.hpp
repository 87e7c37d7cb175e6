// SPDX-License-Identifier: MIT
// The drawing of words by AVX-512, two groups in step where there are two: a round waits long for the one
// before it. Everything is in an unnamed namespace, as the loops of all instruction sets.
#pragma once

#include <Random123/philox.h>
#include <immintrin.h>

#include "link/draw/draw.hpp"

namespace quarzel::link {

namespace {

struct RoundKeys {
    std::uint32_t first[philox4x32_rounds];
    std::uint32_t second[philox4x32_rounds];
};

/// Draw the words of `groups` groups from a counter on, 8 counters in a vector: the upper halves of its lanes
/// may hold anything on the way.
template <std::size_t groups>
[[gnu::always_inline]] inline void drawInStep(const PhiloxInput& input, const RoundKeys& keys,
                                              std::size_t counter, std::uint32_t* words) {
    constexpr std::size_t vectors = 2 * groups;
    constexpr __mmask8 all = 0xff;  // without a mask GCC takes an operand for uninitialised
    const __m512i multiplier0 = _mm512_set1_epi64(PHILOX_M4x32_0);
    const __m512i multiplier1 = _mm512_set1_epi64(PHILOX_M4x32_1);
    const __m512i ofBlock = _mm512_set1_epi64((std::int64_t{1} << input.blockShift) - 1);
    const __m128i blockShift = _mm_cvtsi32_si128(static_cast<int>(input.blockShift));
    __m512i a[vectors];
    __m512i b[vectors];
    __m512i c[vectors];
    __m512i d[vectors];
    for (std::size_t i = 0; i < vectors; ++i) {
        const __m512i counters =
            _mm512_add_epi64(_mm512_set1_epi64(static_cast<std::int64_t>(counter + 8 * i)),
                             _mm512_setr_epi64(0, 1, 2, 3, 4, 5, 6, 7));
        a[i] = _mm512_add_epi64(_mm512_set1_epi64(input.counter[0]), _mm512_and_si512(counters, ofBlock));
        b[i] = _mm512_add_epi64(_mm512_set1_epi64(input.counter[1]),
                                _mm512_maskz_srl_epi64(all, counters, blockShift));
        c[i] = _mm512_set1_epi64(input.counter[2]);
        d[i] = _mm512_set1_epi64(input.counter[3]);
    }
    for (std::size_t round = 0; round < philox4x32_rounds; ++round) {
        const __m512i key0 = _mm512_set1_epi32(static_cast<int>(keys.first[round]));
        const __m512i key1 = _mm512_set1_epi32(static_cast<int>(keys.second[round]));
        for (std::size_t i = 0; i < vectors; ++i) {
            const __m512i product0 = _mm512_maskz_mul_epu32(all, a[i], multiplier0);
            const __m512i product1 = _mm512_maskz_mul_epu32(all, c[i], multiplier1);
            a[i] = _mm512_ternarylogic_epi32(_mm512_maskz_srli_epi64(all, product1, 32), b[i], key0, 0x96);
            b[i] = product1;
            c[i] = _mm512_ternarylogic_epi32(_mm512_maskz_srli_epi64(all, product0, 32), d[i], key1, 0x96);
            d[i] = product0;
        }
    }
    const __m512i lowerHalves = _mm512_setr_epi32(0, 2, 4, 6, 8, 10, 12, 14, 16, 18, 20, 22, 24, 26, 28, 30);
    const auto store = [&](const __m512i(&word)[vectors], std::size_t j) {
        for (std::size_t group = 0; group < groups; ++group) {
            const __m512i halves =
                _mm512_permutex2var_epi32(word[2 * group], lowerHalves, word[2 * group + 1]);
            _mm512_storeu_si512(words + group * wordsPerGroup + j * countersPerGroup, halves);
        }
    };
    store(a, 0);
    store(b, 1);
    store(c, 2);
    store(d, 3);
}

void drawWordsAvx512(const PhiloxInput& input, std::size_t groups, std::uint32_t* words) {
    RoundKeys keys;
    for (std::uint32_t round = 0; round < philox4x32_rounds; ++round) {
        keys.first[round] = input.key[0] + round * PHILOX_W32_0;
        keys.second[round] = input.key[1] + round * PHILOX_W32_1;
    }
    std::size_t group = 0;
    for (; group + 2 <= groups; group += 2) {
        drawInStep<2>(input, keys, group * countersPerGroup, words + group * wordsPerGroup);
    }
    if (group < groups) {
        drawInStep<1>(input, keys, group * countersPerGroup, words + group * wordsPerGroup);
    }
}

}  // namespace

}  // namespace quarzel::link

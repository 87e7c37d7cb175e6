// SPDX-License-Identifier: MIT
// The search of channel outputs in registers, by AVX-512. Everything is in an unnamed namespace, as the loops
// of all instruction sets.
#pragma once

#include <immintrin.h>

#include <cstring>

#include "link/draw/draw.hpp"

namespace quarzel::link {

namespace {

/// Keep what the compiler knows of a vector from what follows: it would split a permutation or a masked
/// addition into slower operations.
inline __m512i opaque(__m512i vector) {
    __asm__("" : "+v"(vector));
    return vector;
}

/// A row of a table, 16 bits for each place.
template <std::size_t places>
class SearchRow {
  public:
    explicit SearchRow(const void* row)
        : itsLower(_mm512_loadu_si512(row)),
          itsUpper(_mm512_loadu_si512(static_cast<const __m512i*>(row) + 1)) {}

    __m512i at(__m512i place) const {
        return places > 32 ? _mm512_permutex2var_epi16(itsLower, place, itsUpper)
                           : _mm512_permutexvar_epi16(place, itsLower);
    }

  private:
    __m512i itsLower;
    __m512i itsUpper;
};

constexpr std::size_t searchVectors = 4;

/// The outputs for code bits of 1; -128 stands for those that are undecided.
template <std::size_t levels>
class Search {
  public:
    explicit Search(const SearchTable& table)
        : itsLast(table.thresholds[levels - 1]), itsOutputs(table.outputs), itsUndecided(table.undecided) {
        for (std::size_t level = 0; level + 1 < levels; ++level) {
            itsThresholds[level] = _mm512_loadu_si512(table.thresholds[level]);
        }
    }

    /// Several vectors of random numbers in step: each level waits long for the one before it.
    void outputs(const __m512i (&random)[searchVectors], __m512i (&output)[searchVectors]) const {
        const __m512i one = _mm512_set1_epi16(1);
        __m512i place[searchVectors];
        for (std::size_t i = 0; i < searchVectors; ++i) {
            place[i] =
                opaque(_mm512_maskz_mov_epi16(_mm512_cmpge_epu16_mask(random[i], itsThresholds[0]), one));
        }
        for (std::size_t level = 1; level + 1 < levels; ++level) {
            const __m512i bit = _mm512_set1_epi16(static_cast<short>(1U << level));
            for (std::size_t i = 0; i < searchVectors; ++i) {
                const __m512i threshold = _mm512_permutexvar_epi16(place[i], itsThresholds[level]);
                const __mmask32 isUpper = _mm512_cmpge_epu16_mask(random[i], threshold);
                place[i] = opaque(_mm512_mask_add_epi16(place[i], isUpper, place[i], bit));
            }
        }
        for (std::size_t i = 0; i < searchVectors; ++i) {
            const __m512i threshold = itsLast.at(place[i]);
            const __mmask32 isUpper = _mm512_cmpge_epu16_mask(random[i], threshold);
            const __m512i lower = opaque(itsOutputs.at(place[i]));
            const __m512i decided = _mm512_mask_add_epi16(lower, isUpper, lower, one);
            const __m512i undecided = _mm512_mask_mov_epi16(itsUndecided.at(place[i]), isUpper, threshold);
            output[i] = _mm512_mask_mov_epi16(decided, _mm512_cmple_epu16_mask(random[i], undecided),
                                              _mm512_set1_epi16(-128));
        }
    }

  private:
    static constexpr std::size_t lastPlaces = std::size_t{1} << (levels - 1);

    __m512i itsThresholds[levels - 1];  ///< of all levels but the last
    SearchRow<lastPlaces> itsLast;
    SearchRow<lastPlaces> itsOutputs;
    SearchRow<lastPlaces> itsUndecided;
};

/// The bytes of 64 outputs in their order, from those of 32 words in two vectors. With its mask the
/// permutation has no operand that GCC takes for uninitialised.
inline __m512i inOrder(__m512i first, __m512i second) {
    const __m512i quadruples = _mm512_setr4_epi32(0x0c080400, 0x0e0a0602, 0x0d090501, 0x0f0b0703);
    const __m512i order = _mm512_setr_epi32(0, 4, 8, 12, 1, 5, 9, 13, 2, 6, 10, 14, 3, 7, 11, 15);
    const __m512i bytes = _mm512_mask_mov_epi8(first, 0xaaaaaaaaaaaaaaaa, _mm512_slli_epi16(second, 8));
    return _mm512_maskz_permutexvar_epi32(0xffff, order, opaque(_mm512_shuffle_epi8(bytes, quadruples)));
}

template <std::size_t levels>
void searchLevels(const std::uint32_t* words, const std::uint8_t* codeBits, unsigned lane,
                  const SearchTable& table, std::size_t count, std::int8_t* soft, std::uint32_t* undecided) {
    constexpr std::size_t step = 64;
    const Search<levels> search(table);
    const __m512i bit = _mm512_set1_epi8(static_cast<char>(1U << lane));
    __m512i random[searchVectors];
    __m512i output[searchVectors];
    for (std::size_t start = 0; start < count; start += searchValues) {
        for (std::size_t i = 0; i < searchVectors; ++i) {
            random[i] = _mm512_loadu_si512(words + start / 2 + i * 16);
        }
        search.outputs(random, output);
        for (std::size_t i = 0; i < searchVectors; i += 2) {
            const std::size_t at = start + i * 32;
            const std::size_t rest = count > at ? count - at : 0;
            const __mmask64 isThere = rest >= step ? ~__mmask64{0} : (__mmask64{1} << rest) - 1;
            const __m512i one = inOrder(output[i], output[i + 1]);
            const __m512i bits = _mm512_maskz_loadu_epi8(isThere, codeBits + at);
            const __m512i value =
                _mm512_mask_sub_epi8(one, _mm512_testn_epi8_mask(bits, bit), _mm512_setzero_si512(), one);
            _mm512_mask_storeu_epi8(soft + at, isThere, value);
            const __mmask64 open = _mm512_mask_cmpeq_epi8_mask(isThere, one, _mm512_set1_epi8(-128));
            std::memcpy(undecided + at / valuesPerLookUp, &open, sizeof open);
        }
    }
}

void search(const std::uint32_t* words, const std::uint8_t* codeBits, unsigned lane, const SearchTable& table,
            std::size_t count, std::int8_t* soft, std::uint32_t* undecided) {
    const auto levels = table.levels == SearchTable::mostLevels ? searchLevels<SearchTable::mostLevels>
                                                                : searchLevels<SearchTable::mostLevels - 1>;
    levels(words, codeBits, lane, table, count, soft, undecided);
}

}  // namespace

}  // namespace quarzel::link

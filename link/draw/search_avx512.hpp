// SPDX-License-Identifier: MIT
// The search of channel outputs in registers, by AVX-512. Everything is in an unnamed namespace, as the loops
// of all instruction sets.
#pragma once

#include <immintrin.h>

#include <cstring>

#include "link/draw/draw.hpp"

namespace quarzel::link {

namespace {

/// Keep what the compiler knows of a vector from what follows: it would split a permutation into slower
/// operations.
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

/// Add to the lanes that are set: compilers make slower operations of the intrinsic.
inline void addWhere(__mmask32 isSet, __m512i addend, __m512i& sum) {
    __asm__("vpaddw %2, %0, %0%{%1%}" : "+v"(sum) : "Yk"(isSet), "v"(addend));
}

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
    template <std::size_t vectors>
    [[gnu::always_inline]] void outputs(const std::uint32_t* words, __m512i (&output)[vectors]) const {
        const __m512i one = _mm512_set1_epi16(1);
        __m512i random[vectors];
        __m512i place[vectors];
        for (std::size_t i = 0; i < vectors; ++i) {
            random[i] = _mm512_loadu_si512(words + i * 16);
            place[i] = _mm512_setzero_si512();
            addWhere(_mm512_cmpge_epu16_mask(random[i], itsThresholds[0]), one, place[i]);
        }
        for (std::size_t level = 1; level + 1 < levels; ++level) {
            const __m512i bit = _mm512_set1_epi16(static_cast<short>(1U << level));
            for (std::size_t i = 0; i < vectors; ++i) {
                const __m512i threshold = _mm512_permutexvar_epi16(place[i], itsThresholds[level]);
                addWhere(_mm512_cmpge_epu16_mask(random[i], threshold), bit, place[i]);
            }
        }
        for (std::size_t i = 0; i < vectors; ++i) {
            const __m512i threshold = itsLast.at(place[i]);
            const __mmask32 isUpper = _mm512_cmpge_epu16_mask(random[i], threshold);
            const __m512i undecided =
                _mm512_mask_mov_epi16(opaque(itsUndecided.at(place[i])), isUpper, threshold);
            __m512i decided = itsOutputs.at(place[i]);
            addWhere(isUpper, one, decided);
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
    const __m512i quadruples = _mm512_setr4_epi32(0x06040200, 0x07050301, 0x0e0c0a08, 0x0f0d0b09);
    const __m512i order = _mm512_setr_epi32(0, 4, 8, 12, 1, 5, 9, 13, 2, 6, 10, 14, 3, 7, 11, 15);
    const __m512i bytes = opaque(_mm512_packs_epi16(first, second));
    return _mm512_maskz_permutexvar_epi32(0xffff, order, opaque(_mm512_shuffle_epi8(bytes, quadruples)));
}

/// What a search is given and what it makes, all from the next output on.
struct SearchStreams {
    const std::uint32_t* words;
    const std::uint8_t* codeBits;
    std::int8_t* soft;
    std::uint32_t* undecided;
};

/// Search for 32 outputs a vector, of which `count` are wanted.
/// @param bit  that of the block in the bytes of code bits
template <std::size_t vectors, std::size_t levels>
[[gnu::always_inline]] inline void searchOnce(const Search<levels>& search, __m512i bit, std::size_t count,
                                              const SearchStreams& streams) {
    constexpr std::size_t step = 64;
    __m512i output[vectors];
    search.outputs(streams.words, output);
    for (std::size_t i = 0; i < vectors; i += 2) {
        const std::size_t at = i * 32;
        const std::size_t rest = count > at ? count - at : 0;
        const __mmask64 isThere = rest >= step ? ~__mmask64{0} : (__mmask64{1} << rest) - 1;
        const __m512i one = inOrder(output[i], output[i + 1]);
        const __m512i bits = _mm512_maskz_loadu_epi8(isThere, streams.codeBits + at);
        const __m512i value =
            _mm512_mask_sub_epi8(one, _mm512_testn_epi8_mask(bits, bit), _mm512_setzero_si512(), one);
        _mm512_mask_storeu_epi8(streams.soft + at, isThere, value);
        const __mmask64 open = _mm512_mask_cmpeq_epi8_mask(isThere, one, _mm512_set1_epi8(-128));
        std::memcpy(streams.undecided + at / valuesPerLookUp, &open, sizeof open);
    }
}

template <std::size_t levels>
void searchLevels(const std::uint32_t* words, const std::uint8_t* codeBits, unsigned lane,
                  const SearchTable& table, std::size_t count, std::int8_t* soft, std::uint32_t* undecided) {
    const Search<levels> search(table);
    const __m512i bit = _mm512_set1_epi8(static_cast<char>(1U << lane));
    const auto from = [&](std::size_t start) {
        return SearchStreams{words + start / 2, codeBits + start, soft + start,
                             undecided + start / valuesPerLookUp};
    };
    std::size_t start = 0;
    for (; start + searchValues < count; start += 2 * searchValues) {
        searchOnce<8>(search, bit, count - start, from(start));
    }
    if (start < count) {
        searchOnce<4>(search, bit, count - start, from(start));
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

// SPDX-License-Identifier: MIT
#pragma once

#include "fixed/unrolled.hpp"
#include "lanes/lane_word.hpp"

// The caller's integers as words of the state format.
namespace quarzel::lanes {
namespace {

/// Values that are read at a time where a segment has as many.
#if defined(__AVX2__)
inline constexpr std::size_t inputWidth = 16;
#else
inline constexpr std::size_t inputWidth = 8;
#endif

template <std::size_t W>
struct IntsOf {
    typedef std::int32_t Signed __attribute__((vector_size(2 * W)));
    typedef std::uint32_t Unsigned __attribute__((vector_size(2 * W)));
};

/// Integers as words, saturated. Each slice of the result holds four of x and four of y.
template <std::size_t W>
inline Lanes<W> pack(typename IntsOf<W>::Signed x, typename IntsOf<W>::Signed y) {
#if defined(__SSE2__)
    if constexpr (W == 8) {
        return {(typename Lanes<W>::Signed)_mm_packs_epi32((__m128i)x, (__m128i)y)};
    }
#if defined(__AVX2__)
    if constexpr (W == 16) {
        return {(typename Lanes<W>::Signed)_mm256_packs_epi32((__m256i)x, (__m256i)y)};
    }
#endif
#elif defined(__aarch64__)
    static_assert(W == 8);
    return {(typename Lanes<W>::Signed)vqmovn_high_s32(vqmovn_s32((int32x4_t)x), (int32x4_t)y)};
#else
    Lanes<W> words;
    for (std::size_t i = 0; i < 4; ++i) {
        const auto saturated = [](std::int32_t v) { return v < -32768 ? -32768 : v > 32767 ? 32767 : v; };
        words.v[i] = static_cast<std::int16_t>(saturated(x[i]));
        words.v[i + 4] = static_cast<std::int16_t>(saturated(y[i]));
    }
    return words;
#endif
}

/// Call `read` with a value of the type of the caller's.
template <class Read>
inline bool withValues(const LaneGroup& group, Read read) {
    switch (group.valueBytes) {
        case 1:
            return read(std::int8_t{});
        case 2:
            return read(std::int16_t{});
        default:
            return read(std::int32_t{});
    }
}

/// Reads values of the caller's and saturates them to the input format.
class SoftInput {
  public:
    /// The next W values from a place, value i in lane `laneOf<Value>(i)`.
    template <std::size_t W>
    Lanes<W> toWords(const std::int32_t* from) {
        const Lanes<W> given = pack<W>(halfOf<W>(from), halfOf<W>(from + W / 2));
        return limited(given, 127 * 16, -128 * 16);
    }

    template <std::size_t W>
    Lanes<W> toWords(const std::int16_t* from) {
        return {limited(Lanes<W>::load(from), 127, -128).v * 16};
    }

    template <std::size_t W>
    static Lanes<W> toWords(const std::int8_t* from) {
        typedef std::int8_t Bytes __attribute__((vector_size(W)));
        Bytes given;
        std::memcpy(&given, from, sizeof given);
        return {__builtin_convertvector(given, typename Lanes<W>::Signed) * 16};
    }

    template <class Value>
    static constexpr std::size_t laneOf(std::size_t i, std::size_t W) {
        // Two vectors of integers are packed slice by slice.
        return sizeof(Value) < 4 ? i : i % 4 + i % (W / 2) / 4 * 8 + i / (W / 2) * 4;
    }

    /// Whether a value was saturated.
    bool saturated() const {
        std::int16_t any = 0;
        for (std::size_t i = 0; i < inputWidth; ++i) {
            any = static_cast<std::int16_t>(any | itsChanges.v[i]);
        }
        return any != 0;
    }

  private:
    /// Half a vector of integers times 16. Bits that the first shift moves out are lost before the
    /// comparison, as in the core.
    template <std::size_t W>
    static typename IntsOf<W>::Signed halfOf(const std::int32_t* from) {
        typename IntsOf<W>::Unsigned values;
        std::memcpy(&values, from, sizeof values);
        return (typename IntsOf<W>::Signed)(values << 8) >> 4;
    }

    template <std::size_t W>
    Lanes<W> limited(Lanes<W> given, std::int16_t most, std::int16_t least) {
        const Lanes<W> x = max(min(given, Lanes<W>::of(most)), Lanes<W>::of(least));
        const Lanes<W> change{x.v ^ given.v};
        if constexpr (W == inputWidth) {
            itsChanges.v |= change.v;
        } else {
            itsChanges.v |= joinSlices(change, change).v;
        }
        return x;
    }

    Lanes<inputWidth> itsChanges = {};
};

}  // namespace
}  // namespace quarzel::lanes

// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>

// QUARZEL_LANES_SHUFFLE: the machine looks up bytes of a slice in one instruction.
#if defined(__SSE2__)
#include <immintrin.h>
#if defined(__SSSE3__)
#define QUARZEL_LANES_SHUFFLE
#endif
#elif defined(__aarch64__)
#include <arm_neon.h>
#define QUARZEL_LANES_SHUFFLE
#endif

#include "lanes/lane_group.hpp"

// QUARZEL_LANES_LOOP: a function without calls. Instrumented, that would take minutes to compile. Where GCC
// has 32 vector registers, it must not inline one either: it would keep pointers in them.
#if defined(__SANITIZE_ADDRESS__)
#define QUARZEL_LANES_LOOP
#elif defined(__AVX512F__) && !defined(__clang__)
#define QUARZEL_LANES_LOOP [[gnu::flatten, gnu::noinline]]
#else
#define QUARZEL_LANES_LOOP [[gnu::flatten]]
#endif

// Everything about lanes is compiled once for each instruction set, and nothing of it may be shared between
// them by the linker: an unnamed namespace keeps every function in its own object.
namespace quarzel::lanes {
namespace {

template <std::size_t Bytes>
struct VectorOf;
#define QUARZEL_LANES_VECTOR(bytes)                                         \
    template <>                                                             \
    struct VectorOf<bytes> {                                                \
        typedef std::int16_t Signed __attribute__((vector_size(bytes)));    \
        typedef std::uint16_t Unsigned __attribute__((vector_size(bytes))); \
        typedef std::uint8_t Bytes __attribute__((vector_size(bytes)));     \
    }
QUARZEL_LANES_VECTOR(16);
QUARZEL_LANES_VECTOR(32);
QUARZEL_LANES_VECTOR(64);
#undef QUARZEL_LANES_VECTOR

/// W 16-bit words. The operations of wrap16.hpp, in every lane at once.
template <std::size_t W>
struct Lanes {
    using Signed = typename VectorOf<2 * W>::Signed;
    using Unsigned = typename VectorOf<2 * W>::Unsigned;

    Signed v;

    static Lanes of(std::int16_t value) { return {Signed{} + value}; }

    static Lanes load(const std::int16_t* from) {
        Lanes lanes;
        std::memcpy(&lanes.v, from, sizeof lanes.v);
        return lanes;
    }

    void store(std::int16_t* to) const { std::memcpy(to, &v, sizeof v); }
};

// Sums are formed unsigned, where a wrap is defined.
template <std::size_t W>
inline Lanes<W> add(Lanes<W> x, Lanes<W> y) {
    using U = typename Lanes<W>::Unsigned;
    return {(typename Lanes<W>::Signed)((U)x.v + (U)y.v)};
}

template <std::size_t W>
inline Lanes<W> sub(Lanes<W> x, Lanes<W> y) {
    using U = typename Lanes<W>::Unsigned;
    return {(typename Lanes<W>::Signed)((U)x.v - (U)y.v)};
}

template <std::size_t W>
inline Lanes<W> max(Lanes<W> x, Lanes<W> y) {
    return {x.v > y.v ? x.v : y.v};
}

template <std::size_t W>
inline Lanes<W> min(Lanes<W> x, Lanes<W> y) {
    return {x.v < y.v ? x.v : y.v};
}

/// Whether all lanes are equal.
template <std::size_t W>
inline bool same(Lanes<W> x, Lanes<W> y) {
    return std::memcmp(&x.v, &y.v, sizeof x.v) == 0;
}

/// What x lacks of a limit, 0 where it lacks nothing; neither is negative. Machines have it as one operation
/// on unsigned words, which GCC does not find by itself.
template <std::size_t W>
inline Lanes<W> subSaturated(Lanes<W> limit, Lanes<W> x) {
#if defined(__SSE2__)
    if constexpr (W == 8) {
        return {(typename Lanes<W>::Signed)_mm_subs_epu16((__m128i)limit.v, (__m128i)x.v)};
    }
#if defined(__AVX2__)
    if constexpr (W == 16) {
        return {(typename Lanes<W>::Signed)_mm256_subs_epu16((__m256i)limit.v, (__m256i)x.v)};
    }
#endif
#if defined(__AVX512BW__)
    if constexpr (W == 32) {
        return {(typename Lanes<W>::Signed)_mm512_subs_epu16((__m512i)limit.v, (__m512i)x.v)};
    }
#endif
#elif defined(__aarch64__)
    static_assert(W == 8);
    return {(typename Lanes<W>::Signed)vqsubq_u16((uint16x8_t)limit.v, (uint16x8_t)x.v)};
#else
    using U = typename Lanes<W>::Unsigned;
    const auto l = (U)limit.v;
    const auto u = (U)x.v;
    return {(typename Lanes<W>::Signed)(l > u ? l - u : U{})};
#endif
}

template <std::size_t W>
inline Lanes<W> operator&(Lanes<W> x, Lanes<W> y) {
    return {x.v & y.v};
}

template <std::size_t W>
inline Lanes<W> operator>>(Lanes<W> x, int count) {
    return {x.v >> count};
}

template <std::size_t W>
inline Lanes<W> chooseBySign(Lanes<W> difference, Lanes<W> x, Lanes<W> y) {
    return {difference.v < 0 ? y.v : x.v};
}

/// Slices side by side, from anywhere.
inline Lanes<16> joinSlices(Lanes<8> x, Lanes<8> y) {
    return {__builtin_shufflevector(x.v, y.v, 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15)};
}
inline Lanes<32> joinSlices(Lanes<8> x0, Lanes<8> x1, Lanes<8> x2, Lanes<8> x3) {
    return {__builtin_shufflevector(joinSlices(x0, x1).v, joinSlices(x2, x3).v, 0, 1, 2, 3, 4, 5, 6, 7, 8, 9,
                                    10, 11, 12, 13, 14, 15, 16, 17, 18, 19, 20, 21, 22, 23, 24, 25, 26, 27,
                                    28, 29, 30, 31)};
}

/// A slice, W / 8 times. A machine with wider vectors loads it so.
template <std::size_t W>
inline Lanes<W> repeated(Lanes<8> x) {
#if defined(__AVX512F__)
    if constexpr (W == 32) {
        // All of a mask: without one, GCC 12 warns about its own header.
        return {(typename Lanes<W>::Signed)_mm512_maskz_broadcast_i32x4(0xFFFF, (__m128i)x.v)};
    }
#endif
#if defined(__AVX2__)
    if constexpr (W == 16) {
        return {(typename Lanes<W>::Signed)_mm256_broadcastsi128_si256((__m128i)x.v)};
    }
#endif
    if constexpr (W == 8) {
        return x;
    }
}

/// A slice of a vector.
template <std::size_t Slice>
inline Lanes<8> sliceOf(Lanes<8> x) {
    static_assert(Slice == 0);
    return x;
}
template <std::size_t Slice>
inline Lanes<8> sliceOf(Lanes<16> x) {
    constexpr int at = Slice * sliceLanes;
    return {__builtin_shufflevector(x.v, x.v, at, at + 1, at + 2, at + 3, at + 4, at + 5, at + 6, at + 7)};
}

inline Lanes<8> loadShuffle(const Shuffle& shuffle) {
    Lanes<8> lanes;
    std::memcpy(&lanes.v, shuffle.bytes, sizeof lanes.v);
    return lanes;
}

/// Move the lanes inside every slice; each slice of `positions` holds a Shuffle.
template <std::size_t W>
inline Lanes<W> shuffleSlices(Lanes<W> x, Lanes<W> positions) {
#if defined(__SSSE3__)
    if constexpr (W == 8) {
        return {(typename Lanes<W>::Signed)_mm_shuffle_epi8((__m128i)x.v, (__m128i)positions.v)};
    }
#if defined(__AVX2__)
    if constexpr (W == 16) {
        return {(typename Lanes<W>::Signed)_mm256_shuffle_epi8((__m256i)x.v, (__m256i)positions.v)};
    }
#endif
#if defined(__AVX512BW__)
    if constexpr (W == 32) {
        return {(typename Lanes<W>::Signed)_mm512_shuffle_epi8((__m512i)x.v, (__m512i)positions.v)};
    }
#endif
#elif defined(__aarch64__)
    static_assert(W == 8);
    return {(typename Lanes<W>::Signed)vqtbl1q_u8((uint8x16_t)x.v, (uint8x16_t)positions.v)};
#else
    static_assert(W == 8);
    Lanes<W> result;
    for (std::size_t lane = 0; lane < W; ++lane) {
        // A shuffle names bytes, two a lane.
        result.v[lane] = x.v[static_cast<std::size_t>(positions.v[lane] & 0xFF) / 2];
    }
    return result;
#endif
}

}  // namespace
}  // namespace quarzel::lanes

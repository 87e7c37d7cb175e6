// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>

/// A group of code blocks of one size, laid out for decoding with every thread segment of every block in a
/// lane of its own. Plain data only: the files of the instruction sets include it.
///
/// Row t holds trellis step t of every segment. Lanes come in slices, eight 16-bit words each; the
/// permutation between the codes moves whole slices and shuffles lanes inside them, never across.
///
/// - A block with 8 or more segments takes segments / 8 slices: segment i is lane i / slices of slice i
/// modulo
///   slices. A bundle is one such block.
/// - With fewer segments, a bundle is a slice that holds 8 / segments blocks side by side.
///
/// Slice o of bundle b starts at lane 8 * (o * bundles + b) of a row.
namespace quarzel::lanes {

inline constexpr std::size_t sliceLanes = 8;

/// Backward windows have at most this many steps.
inline constexpr std::size_t maxWindow = 64;

/// Vectors that the forward half of a window may keep for a step.
inline constexpr std::size_t maxStepVectors = 11;

/// Tail values of a block, in its own order: position by position systematic, parity 1, parity 2.
inline constexpr std::size_t tailSlices = 12;

/// Where a pass finds the lanes of a slice: in slice `slice` of the source row, after shuffle `shuffle`.
struct SliceSource {
    std::uint16_t slice;
    std::uint16_t shuffle;
};

/// Where a pass finds the extrinsic values of each row in the rows of the other code.
struct RowSources {
    const std::uint16_t* row;   ///< [steps] the row
    const SliceSource* slices;  ///< [steps][slices] its slices
};

/// Sixteen byte positions inside a slice.
struct Shuffle {
    alignas(16) std::uint8_t bytes[16];
};

struct LaneGroup {
    std::size_t segments;               ///< thread segments of a block
    std::size_t steps;                  ///< trellis steps of a segment, the number of rows
    std::size_t slices;                 ///< slices of a bundle
    std::size_t bundles;                ///< bundles of the group
    std::size_t windows;                ///< backward windows of a segment
    const std::uint16_t* windowLength;  ///< [windows]
    unsigned iterations;
    const Shuffle* shuffles;
    RowSources natural;      ///< where code 1 finds what code 2 gave
    RowSources interleaved;  ///< where code 2 finds what code 1 gave

    /// Lanes 0 or -1: which lanes of a bundle's first slice hold the first segment of a block, and which of
    /// its last slice the last one.
    alignas(16) std::int16_t firstSegment[sliceLanes];
    alignas(16) std::int16_t lastSegment[sliceLanes];

    /// [3][slices * bundles][8]: for each stream of the caller (systematic, parity 1, parity 2) and lane, the
    /// segment's first value. A lane without a block points to `steps` + 4 zeros. Eight more follow, because
    /// the slice ahead is fetched from memory.
    const void* const* inputs;
    std::size_t valueBytes;  ///< bytes of a value, which is a signed integer: 1, 2 or 4

    /// [slices * bundles][8]: where the segment's decisions go, a byte a bit; null for a lane without a
    /// block.
    unsigned char* const* outputs;

    /// Bytes from the decisions after an iteration to those after the next one; 0 when only those after the
    /// last iteration are wanted.
    std::ptrdiff_t iterationStride;

    /// The words of the step rows: slice o of bundle b of row t starts at o * sliceWords + t * rowWords + 8 *
    /// b. Vectors that hold one slice of several bundles find their rows next to each other.
    std::size_t sliceWords;
    std::size_t rowWords;

    /// @name Work storage; a row is 8 * slices * bundles words
    /// @{
    std::int16_t* systematic;  ///< [steps] step rows, natural order
    std::int16_t* parity[2];   ///< [steps] step rows of code 1 and of code 2
    std::int16_t* tail;        ///< [bundles][tailSlices] slices: in lanes of a last segment its block's tail
    std::int16_t* channel;     ///< [steps] step rows: systematic plus half the extrinsic of code 1
    std::int16_t* llr;  ///< [steps] step rows: LLRs that are decided on; `channel` when those of the last
                        ///< iteration alone are
    std::int16_t* extrinsic;      ///< [steps] step rows: half the extrinsic of code 2
    std::int16_t* alphaState;     ///< [16] rows: forward metrics and pending corrections between windows
    std::int16_t* alphaStart[2];  ///< per code, [8] rows: starts of the next pass
    std::int16_t* betaStart[2];   ///< per code, [windows][8] rows: starts of the next pass
    std::int16_t* boundary;       ///< [8] rows: the last metrics of each segment in the direction at hand
    std::int16_t* stepRows;       ///< [maxWindow][up to maxStepVectors] vectors: what a window's forward half
                                  ///< leaves for its backward half
    /// @}
};

/// How a group is decoded by one instruction set at one width.
struct LaneKernel {
    std::size_t width;  ///< lanes of a vector: 8, 16 or 32

    /// Decode a group whose vectors hold the same slice of width / 8 bundles: bundles == width / 8.
    /// [algorithm type 0, 1, 2]
    /// @return whether a soft value was saturated
    bool (*acrossBundles[3])(const LaneGroup&);

    /// Decode one bundle whose vectors hold width / 8 of its slices. Null at a width of 8.
    bool (*acrossSlices[3])(const LaneGroup&);

    /// Decode one block of one segment, whose rows are single words: the eight states of its trellis fill the
    /// lanes. Null where there is no such kernel.
    bool (*alone[3])(const LaneGroup&);
};

}  // namespace quarzel::lanes

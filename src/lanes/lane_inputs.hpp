// SPDX-License-Identifier: MIT
#pragma once

#include "lanes/lane_soft_input.hpp"
#include "lanes/lane_transpose.hpp"

// From the caller's arrays to the rows of a group.
namespace quarzel::lanes {
namespace {

/// The arrays of the lanes of a slice, in one stream.
template <class Value>
class SliceInputs {
  public:
    SliceInputs(const LaneGroup& group, std::size_t stream, std::size_t slice)
        : itsLanes(group.inputs + (stream * group.slices * group.bundles + slice) * sliceLanes) {}

    /// Read the values of W steps from step t on.
    /// @param store  takes `(step, Lanes<8>)`, a step of all lanes
    template <std::size_t W, class Store>
    void read(SoftInput& input, std::size_t t, Store store) const {
        Squares<W> squares;
        unrolled<sliceLanes>([&](auto lane) {
            // What comes next lies elsewhere: in other segments, or another stream.
            __builtin_prefetch(valuesOf(sliceLanes + lane) + t);
            squares[lane] = input.toWords<W>(valuesOf(lane) + t);
        });
        squares = transpose<W>(squares);
        unrolled<W>([&](auto i) {
            constexpr std::size_t at = SoftInput::laneOf<Value>(i, W);
            store(t + i, sliceOf<at / sliceLanes>(squares[at % sliceLanes]));
        });
    }

  private:
    const Value* valuesOf(std::size_t lane) const { return static_cast<const Value*>(itsLanes[lane]); }

    const void* const* itsLanes;
};

/// Fill the rows of the soft inputs.
template <class Value>
inline void readSteps(const LaneGroup& group, SoftInput& input) {
    std::int16_t* const rows[3] = {group.systematic, group.parity[0], group.parity[1]};
    for (std::size_t stream = 0; stream < 3; ++stream) {
        forEachSlice(group, [&](std::size_t slice, std::size_t word) {
            const SliceInputs<Value> values(group, stream, slice);
            const auto store = [first = rows[stream] + word, &group](std::size_t t, Lanes<8> step) {
                step.store(first + t * group.rowWords);
            };
            std::size_t t = 0;
            for (; t + inputWidth <= group.steps; t += inputWidth) {
                values.template read<inputWidth>(input, t, store);
            }
            // What is left is read with some of the steps before, once more.
            if (t + 8 < group.steps) {
                values.template read<inputWidth>(input, group.steps - inputWidth, store);
            } else if (t < group.steps) {
                values.template read<8>(input, group.steps - 8, store);
            }
        });
    }
}

/// Fill the tail slices from the four values of each stream that follow a last segment's.
template <class Value>
inline void readTails(const LaneGroup& group, SoftInput& input) {
    for (std::size_t stream = 0; stream < 3; ++stream) {
        for (std::size_t bundle = 0; bundle < group.bundles; ++bundle) {
            const SliceInputs<Value> values(group, stream, (group.slices - 1) * group.bundles + bundle);
            std::int16_t* const tail = group.tail + bundle * tailSlices * sliceLanes;
            values.template read<8>(input, group.steps - 4, [&](std::size_t t, Lanes<8> position) {
                if (t >= group.steps) {
                    position.store(tail + (3 * (t - group.steps) + stream) * sliceLanes);
                }
            });
        }
    }
}

template <class Value>
QUARZEL_LANES_LOOP inline bool readValues(const LaneGroup& group) {
    SoftInput input;
    readSteps<Value>(group, input);
    readTails<Value>(group, input);
    return input.saturated();
}

/// Read every value of the caller's.
/// @return whether one was saturated
inline bool readInputs(const LaneGroup& group) {
    return withValues(group, [&](auto value) { return readValues<decltype(value)>(group); });
}

}  // namespace
}  // namespace quarzel::lanes
